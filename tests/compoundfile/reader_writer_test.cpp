#include <gtest/gtest.h>

#include <algorithm>
#include <numeric>
#include <random>
#include <stdexcept>

#include "base/bytes.h"
#include "base/text.h"
#include "base/utf.h"
#include "compoundfile/format.h"
#include "compoundfile/reader.h"
#include "compoundfile/writer.h"
#include "support/random_bytes.h"

namespace kestrune::compoundfile {
namespace {

// Reads a whole stream in pieces of `step` bytes, so that reads cross sector boundaries.
std::vector<unsigned char> ReadAll(StreamReader& stream, std::size_t step) {
  std::vector<unsigned char> bytes;
  std::vector<unsigned char> piece(step);
  for (;;) {
    const std::size_t got = stream.Read(piece.data(), step);
    bytes.insert(bytes.end(), piece.begin(), piece.begin() + static_cast<std::ptrdiff_t>(got));
    if (got < step) return bytes;
  }
}

TEST(CompoundFile, StreamsOfEverySizeClassReadBackWhole) {
  // Around the mini sector (64), the sector (512) and the mini stream cut-off (4096).
  const std::size_t sizes[] = {0, 1, 63, 64, 65, 511, 512, 513, 4095, 4096, 4097, 42000};
  std::vector<NamedStream> streams;
  for (const std::size_t size : sizes) {
    streams.push_back(
        {u"s" + std::u16string(size % 7 + 1, u'x') + AsciiToUtf16(std::to_string(size)),
         test::RandomBytes(size, static_cast<unsigned>(size))});
  }
  const auto file = WriteCompoundFile(streams);
  EXPECT_EQ(file.size() % kSectorSize, 0u);

  const auto reader = CompoundFileReader::Open(file);
  ASSERT_TRUE(reader);
  EXPECT_EQ(reader->StreamNames().size(), streams.size());
  for (const NamedStream& written : streams) {
    for (const std::size_t step : {std::size_t{7}, std::size_t{4096}}) {
      auto stream = reader->OpenStream(written.name);
      ASSERT_TRUE(stream) << written.bytes.size();
      EXPECT_EQ(stream->Size(), written.bytes.size());
      EXPECT_EQ(ReadAll(*stream, step), written.bytes) << written.bytes.size() << " by " << step;
    }
  }
}

TEST(CompoundFile, AnEmptyRootOpensWithNoStreams) {
  const auto file = WriteCompoundFile({});
  EXPECT_EQ(file.size(), 3 * kSectorSize);  // header, FAT, directory
  const auto reader = CompoundFileReader::Open(file);
  ASSERT_TRUE(reader);
  EXPECT_TRUE(reader->StreamNames().empty());
  EXPECT_FALSE(reader->OpenStream(u"anything"));
}

TEST(CompoundFile, NamesMatchWithAsciiCaseFoldedAndNothingElse) {
  const std::vector<NamedStream> streams = {{u"Main.htm", {1, 2, 3}}, {u"Other", {4}}};
  const auto file = WriteCompoundFile(streams);
  const auto reader = CompoundFileReader::Open(file);
  ASSERT_TRUE(reader);
  EXPECT_TRUE(reader->OpenStream(u"MAIN.HTM"));
  EXPECT_TRUE(reader->OpenStream(u"main.htm"));
  EXPECT_FALSE(reader->OpenStream(u"main.htm "));
  EXPECT_FALSE(reader->OpenStream(u"main"));
}

TEST(CompoundFile, AFatLongerThanTheHeaderListsReadsThroughDifatSectors) {
  // 110 FAT sectors cover about 7 MB; 8 MB needs a DIFAT sector beyond the header's 109.
  const std::vector<NamedStream> streams = {{u"big", test::RandomBytes(8u << 20, 1)},
                                            {u"small", test::RandomBytes(100, 2)}};
  const auto file = WriteCompoundFile(streams);
  EXPECT_GE(LoadU32Le(file.data() + header::kFatSectorCount), 110u);
  EXPECT_EQ(LoadU32Le(file.data() + header::kDifatSectorCount), 1u);
  const auto reader = CompoundFileReader::Open(file);
  ASSERT_TRUE(reader);
  for (const NamedStream& written : streams) {
    auto stream = reader->OpenStream(written.name);
    ASSERT_TRUE(stream);
    EXPECT_EQ(ReadAll(*stream, 1u << 20), written.bytes);
  }
}

TEST(CompoundFile, WriterRefusesNamesACompoundFileCannotHold) {
  const auto write = [](std::u16string name) {
    const std::vector<NamedStream> streams = {{std::move(name), {}}};
    return WriteCompoundFile(streams);
  };
  EXPECT_THROW(write(u""), std::invalid_argument);
  EXPECT_THROW(write(std::u16string(32, u'a')), std::invalid_argument);
  EXPECT_NO_THROW(write(std::u16string(31, u'a')));
  for (const char16_t* bad : {u"a/b", u"a\\b", u"a:b", u"a!b", u"caf\u00e9", u"tab\t"}) {
    EXPECT_THROW(write(bad), std::invalid_argument) << EncodeUtf8(bad);
  }
  const std::vector<NamedStream> twins = {{u"Same", {}}, {u"sAME", {}}};
  EXPECT_THROW(WriteCompoundFile(twins), std::invalid_argument);
}

// The sibling tree as ole32 walks it: a search tree in directory order (shorter names first,
// then case-folded units), and a valid red-black tree.
struct TreeCheck {
  const std::vector<unsigned char>& file;
  std::size_t directory;

  const unsigned char* Entry(std::uint32_t id) const {
    return file.data() + directory + id * kDirectoryEntrySize;
  }
  std::u16string Name(std::uint32_t id) const {
    std::u16string name;
    for (std::size_t i = 0; i + 1 < LoadU16Le(Entry(id) + entry::kNameLength) / 2u; ++i) {
      name += LoadU16Le(Entry(id) + 2 * i);
    }
    return name;
  }
  // Black entries on every path down from `id`, or -1 when the tree breaks a rule below it.
  int BlackHeight(std::uint32_t id, const std::u16string* low, const std::u16string* high,
                  bool parentRed, std::size_t& count) const {
    if (id == kNoEntry) return 1;
    ++count;
    const std::u16string name = Name(id);
    if ((low && CompareEntryNames(*low, name) >= 0) ||
        (high && CompareEntryNames(name, *high) >= 0)) {
      return -1;
    }
    const bool red = Entry(id)[entry::kColor] == static_cast<unsigned char>(EntryColor::kRed);
    if (red && parentRed) return -1;
    const int left =
        BlackHeight(LoadU32Le(Entry(id) + entry::kLeftSibling), low, &name, red, count);
    const int right =
        BlackHeight(LoadU32Le(Entry(id) + entry::kRightSibling), &name, high, red, count);
    if (left < 0 || left != right) return -1;
    return left + (red ? 0 : 1);
  }
};

TEST(CompoundFile, SiblingTreeIsAValidRedBlackSearchTreeForAnyCount) {
  for (std::size_t count = 1; count <= 40; ++count) {
    std::vector<std::size_t> keys(count);
    std::iota(keys.begin(), keys.end(), std::size_t{0});
    std::shuffle(keys.begin(), keys.end(), std::mt19937(static_cast<unsigned>(count)));
    std::vector<NamedStream> streams;
    for (const std::size_t key : keys) {  // mixed lengths and cases, in no particular order
      streams.push_back({(key % 2 ? u"N" : u"n") + std::u16string(key % 3, u'_') +
                             AsciiToUtf16(std::to_string(key)),
                         {}});
    }
    const auto file = WriteCompoundFile(streams);
    const TreeCheck check{
        file, (LoadU32Le(file.data() + header::kFirstDirectorySector) + 1) * kSectorSize};
    const std::uint32_t top = LoadU32Le(check.Entry(0) + entry::kChild);
    EXPECT_EQ(check.Entry(top)[entry::kColor], static_cast<unsigned char>(EntryColor::kBlack));
    std::size_t reached = 0;
    EXPECT_GT(check.BlackHeight(top, nullptr, nullptr, false, reached), 0) << count << " streams";
    EXPECT_EQ(reached, count);
  }
}

}  // namespace
}  // namespace kestrune::compoundfile
