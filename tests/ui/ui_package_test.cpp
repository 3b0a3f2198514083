#include "ui/package/ui_package.h"

#include <gtest/gtest.h>

#include "base/bytes.h"
#include "base/utf.h"
#include "compoundfile/reader.h"
#include "compoundfile/writer.h"
#include "support/random_bytes.h"
#include "ui/package/packaged_file.h"
#include "ui/package/stream_name.h"
#include "uipack/package_builder.h"

namespace kestrune::ui {
namespace {

using Bytes = std::vector<unsigned char>;

Bytes Package(std::vector<uipack::UiFile> files) { return uipack::BuildUiPackage(files); }

// The stream as stored, read with our own reader whatever the platform.
Bytes RawStream(const Bytes& package, std::u16string_view request) {
  const auto reader = compoundfile::CompoundFileReader::Open(package);
  if (!reader) return {};
  auto stream = reader->OpenStream(StreamNameFor(request));
  if (!stream) return {};
  Bytes bytes(static_cast<std::size_t>(stream->Size()));
  bytes.resize(stream->Read(bytes.data(), bytes.size()));
  return bytes;
}

TEST(UiPackage, AFileIsStoredPaddedToWholeBlocksAndLoadsAtItsOwnLength) {
  const Bytes odd = test::RandomBytes(761, 1);
  const Bytes whole = test::RandomBytes(504, 2);
  const Bytes package = Package({{u"odd.htm", odd}, {u"whole.htm", whole}, {u"empty.css", {}}});

  const Bytes oddStream = RawStream(package, u"odd.htm");
  ASSERT_EQ(oddStream.size(), 776u);
  EXPECT_EQ(LoadU32Le(oddStream.data()), 761u);
  EXPECT_EQ(LoadU32Le(oddStream.data() + 4), 768u);
  EXPECT_EQ(UiPackage::Load(package, u"odd.htm"), odd);

  const Bytes wholeStream = RawStream(package, u"whole.htm");
  ASSERT_EQ(wholeStream.size(), 512u);
  EXPECT_EQ(LoadU32Le(wholeStream.data()), 504u);
  EXPECT_EQ(LoadU32Le(wholeStream.data() + 4), 504u);
  EXPECT_EQ(UiPackage::Load(package, u"whole.htm"), whole);

  EXPECT_EQ(RawStream(package, u"empty.css").size(), 8u);
  EXPECT_EQ(UiPackage::Load(package, u"empty.css"), Bytes{});
}

TEST(UiPackage, BlocksAreEncipheredEachOnItsOwn) {
  Bytes first(24, 'x');
  Bytes second(24, 'x');
  second[20] = 'y';  // same first two blocks, a different third
  Bytes third(24, 'x');
  third[0] = 'y';
  const Bytes package = Package({{u"1", first}, {u"2", second}, {u"3", third}});
  const Bytes a = RawStream(package, u"1");
  const Bytes b = RawStream(package, u"2");
  const Bytes c = RawStream(package, u"3");
  ASSERT_EQ(a.size(), 32u);
  ASSERT_EQ(b.size(), 32u);
  ASSERT_EQ(c.size(), 32u);
  EXPECT_TRUE(std::equal(a.begin() + 8, a.begin() + 24, b.begin() + 8));
  EXPECT_FALSE(std::equal(a.begin() + 24, a.end(), b.begin() + 24));
  EXPECT_FALSE(std::equal(a.begin() + 8, a.begin() + 16, c.begin() + 8));
  EXPECT_FALSE(std::equal(first.begin(), first.begin() + 8, a.begin() + 8));  // not stored plain
}

TEST(UiPackage, FindsAFileByItsRequestNameWithAsciiCaseFoldedOnly) {
  const Bytes css = test::RandomBytes(300, 3);
  const Bytes package = Package({{u"styles/main.css", css}});
  EXPECT_EQ(UiPackage::Load(package, u"styles/main.css"), css);
  EXPECT_EQ(UiPackage::Load(package, u"STYLES/Main.CSS"), css);
  for (const char16_t* other : {u"styles/main.css ", u"main.css", u"styles\\main.css",
                                u"/styles/main.css", u"./styles/main.css"}) {
    EXPECT_FALSE(UiPackage::Load(package, other)) << EncodeUtf8(other);
  }
}

// A package written stream by stream, so that each stream can be inconsistent in its own way.
Bytes PackageOfStreams(std::vector<std::pair<std::u16string, Bytes>> contents) {
  std::vector<compoundfile::NamedStream> streams;
  for (auto& [request, bytes] : contents)
    streams.push_back({StreamNameFor(request), std::move(bytes)});
  return compoundfile::WriteCompoundFile(streams);
}

Bytes Lengths(std::uint32_t plain, std::uint32_t stored, std::size_t following) {
  Bytes bytes(8 + following, 0);
  StoreU32Le(bytes.data(), plain);
  StoreU32Le(bytes.data() + 4, stored);
  return bytes;
}

TEST(UiPackage, RefusesStreamsWhoseLengthsDoNotAddUp) {
  const Bytes file = test::RandomBytes(100, 4);
  Bytes longer = EncipherFile(file);
  longer.insert(longer.end(), 5, 0);
  const Bytes package = PackageOfStreams({
      {u"good", EncipherFile(file)},
      {u"longer", longer},                           // bytes after S are not part of the file
      {u"short", Bytes(5, 0)},                       // not even the two lengths
      {u"partial", Lengths(10, 12, 12)},             // S not whole blocks
      {u"below", Lengths(20, 16, 16)},               // S shorter than the file
      {u"beyond", Lengths(16, 24, 16)},              // S more than the stream holds
      {u"huge", Lengths(0, 0xFFFFFFF8, 8)},          // refused before a buffer is made
      {u"large beyond", Lengths(6000, 6000, 5000)},  // the same in a stream of its own sectors
  });
  EXPECT_EQ(UiPackage::Load(package, u"good"), file);
  EXPECT_EQ(UiPackage::Load(package, u"longer"), file);
  for (const char16_t* bad :
       {u"short", u"partial", u"below", u"beyond", u"huge", u"large beyond"}) {
    EXPECT_FALSE(UiPackage::Load(package, bad)) << EncodeUtf8(bad);
  }
}

TEST(UiPackage, AMissingFileOrABrokenPackageAnswersFailure) {
  const Bytes package = Package({{u"main.htm", test::RandomBytes(50, 5)}});
  EXPECT_FALSE(UiPackage::Load(package, u"other.htm"));
  EXPECT_FALSE(UiPackage::Load(Bytes{}, u"main.htm"));
  EXPECT_FALSE(UiPackage::Load(test::RandomBytes(2048, 6), u"main.htm"));
  Bytes truncated = package;
  truncated.resize(700);
  EXPECT_FALSE(UiPackage::Load(truncated, u"main.htm"));
}

TEST(UiPackage, AProgramThatCarriesNoPackageLoadsNothing) {
  EXPECT_FALSE(UiPackage::Load(u"main.htm"));
}

}  // namespace
}  // namespace kestrune::ui
