// Compound files with every kind of damage: the reader refuses them, or the one damaged stream,
// without crashing, looping or reading outside the file.
#include <gtest/gtest.h>

#include "base/bytes.h"
#include "compoundfile/format.h"
#include "compoundfile/reader.h"
#include "compoundfile/writer.h"

namespace kestrune::compoundfile {
namespace {

class BrokenFile : public ::testing::Test {
 protected:
  // A small stream in the mini stream, one in sectors of its own, an empty one.
  void SetUp() override { Write(5000); }

  void Write(std::size_t largeSize) {
    const std::vector<NamedStream> streams = {{u"alpha", std::vector<unsigned char>(100, 'a')},
                                              {u"beta", std::vector<unsigned char>(largeSize, 'b')},
                                              {u"gamma", {}}};
    file_ = WriteCompoundFile(streams);
  }

  std::uint32_t Get(std::size_t at) const { return LoadU32Le(file_.data() + at); }
  void Put(std::size_t at, std::uint32_t value) { StoreU32Le(file_.data() + at, value); }
  static std::size_t Sector(std::uint32_t sector) {
    return (sector + std::size_t{1}) * kSectorSize;
  }
  std::uint32_t SectorCount() const {
    return static_cast<std::uint32_t>(file_.size() / kSectorSize - 1);
  }

  std::size_t Entry(std::uint32_t id) const {
    return Sector(Get(header::kFirstDirectorySector)) + id * kDirectoryEntrySize;
  }
  std::uint32_t IdOf(std::u16string_view name) const {
    for (std::uint32_t id = 1; id < 4; ++id) {
      if (LoadU16Le(file_.data() + Entry(id)) == name[0]) return id;
    }
    return kNoEntry;
  }
  std::size_t Fat(std::uint32_t sector) const { return Sector(Get(header::kDifat)) + 4 * sector; }
  std::size_t MiniFat(std::uint32_t mini) const {
    return Sector(Get(header::kFirstMiniFatSector)) + 4 * mini;
  }
  std::uint32_t StartOf(std::u16string_view name) const {
    return Get(Entry(IdOf(name)) + entry::kStartSector);
  }

  bool Opens() const { return CompoundFileReader::Open(file_).has_value(); }
  // Whether the file opens and this one stream opens in it, while the others still do.
  bool OnlyThisStreamRefused(std::u16string_view name) const {
    const auto reader = CompoundFileReader::Open(file_);
    if (!reader) return false;
    bool othersOpen = true;
    for (const std::u16string& other : reader->StreamNames()) {
      if (other != name) othersOpen = othersOpen && reader->OpenStream(other).has_value();
    }
    return othersOpen && !reader->OpenStream(name);
  }

  std::vector<unsigned char> file_;
};

TEST_F(BrokenFile, TheIntactFileOpensWithEveryStream) {
  const auto reader = CompoundFileReader::Open(file_);
  ASSERT_TRUE(reader);
  EXPECT_EQ(reader->StreamNames(), (std::vector<std::u16string>{u"beta", u"alpha", u"gamma"}));
  for (const auto& name : reader->StreamNames()) EXPECT_TRUE(reader->OpenStream(name));
}

TEST_F(BrokenFile, AnythingButAVersion3HeaderIsRefused) {
  for (const std::size_t size : {std::size_t{0}, std::size_t{100}, kHeaderSize - 1}) {
    EXPECT_FALSE(CompoundFileReader::Open(std::span(file_.data(), size))) << size;
  }
  const std::vector<std::pair<std::size_t, std::uint16_t>> damage = {
      {0, 0xCFD1},                   // signature
      {header::kByteOrder, 0xFEFF},  // big-endian mark
      {header::kMajorVersion, 4},    // 4096-byte sectors
      {header::kSectorShift, 12},
      {header::kMiniSectorShift, 7},
      {header::kMiniStreamCutoff, 0x2000}};  // mini streams up to 8 KB
  for (const auto& [at, value] : damage) {
    const auto intact = file_;
    StoreU16Le(file_.data() + at, value);
    EXPECT_FALSE(Opens()) << "field at " << at;
    file_ = intact;
  }
}

TEST_F(BrokenFile, AFatSectorOutsideTheFileIsRefused) {
  Put(header::kDifat, SectorCount());
  EXPECT_FALSE(Opens());
  Put(header::kDifat, 0);
  Put(header::kFatSectorCount, SectorCount() + 1);
  EXPECT_FALSE(Opens());
  Put(header::kFatSectorCount, 2);  // the second is listed as a free sector
  EXPECT_FALSE(Opens());
}

TEST_F(BrokenFile, ALoopingOrMissingDifatChainIsRefused) {
  Write(130000);  // about 260 sectors: room to claim more FAT sectors than the header lists
  // The FAT is listed as sector 0 over and over, which is odd but readable: 109 times in the
  // header, then 127 times in one DIFAT sector.
  const std::uint32_t difat = SectorCount() - 1;
  for (std::size_t i = 0; i < kHeaderDifatCount; ++i) Put(header::kDifat + 4 * i, 0);
  for (std::size_t i = 0; i < 127; ++i) Put(Sector(difat) + 4 * i, 0);
  Put(header::kFirstDifatSector, difat);
  Put(Sector(difat) + 4 * 127, kEndOfChain);
  Put(header::kFatSectorCount, 109 + 127);
  ASSERT_TRUE(Opens());

  Put(header::kFatSectorCount, 109 + 127 + 1);  // one more than the chain lists
  EXPECT_FALSE(Opens());
  Put(Sector(difat) + 4 * 127, difat);  // the chain comes back to its start
  EXPECT_FALSE(Opens());
  Put(Sector(difat) + 4 * 127, SectorCount());
  EXPECT_FALSE(Opens());
}

TEST_F(BrokenFile, ABrokenDirectoryChainIsRefused) {
  const std::uint32_t directory = Get(header::kFirstDirectorySector);
  const auto intact = file_;
  Put(Fat(directory), directory);  // loops onto itself
  EXPECT_FALSE(Opens());
  file_ = intact;
  Put(Fat(directory), kFreeSector);
  EXPECT_FALSE(Opens());
  file_ = intact;
  Put(header::kFirstDirectorySector, SectorCount());
  EXPECT_FALSE(Opens());
  Put(header::kFirstDirectorySector, kEndOfChain);
  EXPECT_FALSE(Opens());
}

TEST_F(BrokenFile, DirectoryEntriesOutOfRangeOrInACycleAreRefused) {
  const std::size_t root = Entry(0);
  const std::uint32_t top = Get(root + entry::kChild);
  const std::uint32_t leaf = Get(Entry(top) + entry::kRightSibling);
  const std::vector<std::pair<std::size_t, std::uint32_t>> damage = {
      {root + entry::kChild, 4},  // past the last entry
      {root + entry::kChild, 0xFFFFFFF0},
      {Entry(leaf) + entry::kRightSibling, top},  // back up the tree
      {Entry(leaf) + entry::kLeftSibling, leaf},  // itself
      {Entry(leaf) + entry::kLeftSibling, 0}};    // the root
  for (const auto& [at, value] : damage) {
    const auto intact = file_;
    Put(at, value);
    EXPECT_FALSE(Opens()) << at << " = " << value;
    file_ = intact;
  }
}

TEST_F(BrokenFile, EntriesOfTheWrongKindOrWithImpossibleNamesAreRefused) {
  const auto intact = file_;
  file_[Entry(0) + entry::kType] = static_cast<unsigned char>(EntryType::kStorage);
  EXPECT_FALSE(Opens());
  for (const EntryType type : {EntryType::kUnallocated, EntryType::kRoot}) {
    file_ = intact;
    file_[Entry(IdOf(u"beta")) + entry::kType] = static_cast<unsigned char>(type);
    EXPECT_FALSE(Opens());
  }
  for (const int length : {0, 1, 7, 66}) {
    file_ = intact;
    StoreU16Le(file_.data() + Entry(IdOf(u"beta")) + entry::kNameLength,
               static_cast<std::uint16_t>(length));
    EXPECT_FALSE(Opens()) << length;
  }
}

TEST_F(BrokenFile, ADamagedChainRefusesOnlyItsOwnStream) {
  const std::uint32_t beta = StartOf(u"beta");
  const std::uint32_t alpha = StartOf(u"alpha");
  const std::vector<std::pair<std::size_t, std::uint32_t>> damage = {
      {Fat(beta + 3), beta + 1},       // loops back
      {Fat(beta + 2), SectorCount()},  // leaves the file
      {Fat(beta + 2), 0xFFFF0000},
      {Fat(beta + 2), kFreeSector},  // ends in a free sector
      {Fat(beta + 2), kEndOfChain},  // ends before the size does
      {Entry(IdOf(u"beta")) + entry::kStartSector, SectorCount()},
      {Entry(IdOf(u"beta")) + entry::kSize, 5000 + 20 * 512},
      {Entry(IdOf(u"beta")) + entry::kSize, 0xFFFFFFFF}};
  for (const auto& [at, value] : damage) {
    const auto intact = file_;
    Put(at, value);
    EXPECT_TRUE(OnlyThisStreamRefused(u"beta")) << at << " = " << value;
    file_ = intact;
  }
  const std::vector<std::pair<std::size_t, std::uint32_t>> miniDamage = {
      {MiniFat(alpha), alpha},                           // loops onto itself
      {MiniFat(alpha), 1000},                            // past the mini stream
      {Entry(IdOf(u"alpha")) + entry::kStartSector, 8},  // first unit past it
      {Entry(IdOf(u"alpha")) + entry::kSize, 4000}};     // more than it holds
  for (const auto& [at, value] : miniDamage) {
    const auto intact = file_;
    Put(at, value);
    EXPECT_TRUE(OnlyThisStreamRefused(u"alpha")) << at << " = " << value;
    file_ = intact;
  }
}

TEST_F(BrokenFile, AMiniStreamLargerThanItsChainIsRefused) {
  Put(Entry(0) + entry::kSize, 5 * 512);
  EXPECT_FALSE(Opens());
}

TEST_F(BrokenFile, ATruncatedFileKeepsOnlyWhatItStillHolds) {
  file_.resize(file_.size() - kSectorSize / 2);  // beta's last sector is now partial
  EXPECT_TRUE(OnlyThisStreamRefused(u"beta"));
  file_.resize(2 * kSectorSize);  // the directory is gone
  EXPECT_FALSE(Opens());
}

// Every byte of the header, FAT, directory and mini FAT changed in turn: whatever still opens
// reads each of its streams as exactly the size it claims, from inside the file.
TEST_F(BrokenFile, NoSingleByteDamageBreaksTheReader) {
  const auto intact = file_;
  const std::size_t metadataEnd = Sector(Get(header::kFirstMiniFatSector) + 1);
  std::size_t opened = 0;
  for (std::size_t at = 0; at < metadataEnd; ++at) {
    for (const int value : {0x00, 0xFF, intact[at] ^ 0x80}) {
      file_ = intact;
      file_[at] = static_cast<unsigned char>(value);
      const auto reader = CompoundFileReader::Open(file_);
      if (!reader) continue;
      ++opened;
      for (const auto& name : reader->StreamNames()) {
        auto stream = reader->OpenStream(name);
        if (!stream) continue;
        std::vector<unsigned char> sink(4096);
        std::uint64_t total = 0;
        while (const std::size_t got = stream->Read(sink.data(), sink.size())) total += got;
        ASSERT_EQ(total, stream->Size()) << "byte " << at << " = " << value;
      }
    }
  }
  EXPECT_GT(opened, 0u);  // most damage falls on unused fields and is harmless
}

}  // namespace
}  // namespace kestrune::compoundfile
