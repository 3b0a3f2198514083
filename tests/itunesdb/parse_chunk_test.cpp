#include "itunesdb/parse_chunk.h"

#include <gtest/gtest.h>

#include "base/bytes.h"
#include "base/paths.h"
#include "mkipod/record_builder.h"
#include "support/temp_folder.h"

namespace kestrune::itunesdb {
namespace {

using mkipod::Bytes;
using mkipod::RecordBuilder;

Bytes Concat(std::initializer_list<Bytes> parts) {
  Bytes all;
  for (const Bytes& part : parts) mkipod::Append(all, part);
  return all;
}

Bytes Mhbd(std::initializer_list<Bytes> sets) {
  RecordBuilder mhbd("mhbd", 104);
  for (const Bytes& set : sets) mhbd.Child(set);
  return mhbd.AsList(20);
}

Bytes Mhsd(std::uint32_t type, std::initializer_list<Bytes> children = {}) {
  RecordBuilder mhsd("mhsd", 96);
  mhsd.U32(12, type);
  for (const Bytes& child : children) mhsd.Child(child);
  return mhsd.ByLength();
}

// Parses bytes written to a file, the way the loader reads a device's database.
class ParseTest : public ::testing::Test {
 protected:
  DbChunk Parse(const Bytes& bytes) {
    const auto path = folder_ / "iTunesDB";
    test::WriteBytes(path, bytes);
    FileHandle file = OpenForReading(path);
    FileChunkReader reader(file.get(), arena_);
    DbChunk root = ParseDatabase(reader, arena_);
    endPosition_ = reader.Tell();
    return root;
  }

  test::TempFolder folder_;
  RecordArena arena_;
  std::int32_t endPosition_ = -1;
};

TEST_F(ParseTest, HeaderOnlyRootHasNoChildren) {
  const DbChunk root = Parse(Mhbd({}));
  EXPECT_EQ(root.Tag(), kTagMhbd);
  EXPECT_EQ(root.rawRecord.size(), 104u);
  EXPECT_TRUE(root.children.empty());
}

TEST_F(ParseTest, EmptyContainersHaveNoChildrenAndReadNothingMore) {
  const Bytes emptySet = Mhsd(1);
  RecordBuilder emptyList("mhlt", 92);
  const DbChunk root = Parse(Mhbd({emptySet, Mhsd(2, {emptyList.AsList()})}));
  ASSERT_EQ(root.children.size(), 2u);
  EXPECT_TRUE(root.children[0].children.empty());
  ASSERT_EQ(root.children[1].children.size(), 1u);
  EXPECT_TRUE(root.children[1].children[0].children.empty());
  EXPECT_EQ(endPosition_, 104 + 96 + 96 + 92);
}

TEST_F(ParseTest, KeepsHeadersOnlyButStringRecordsWhole) {
  RecordBuilder track("mhit", 156);
  track.U32(16, 52).Child(mkipod::StringMhod(1, u"Title"));
  RecordBuilder list("mhlt", 92);
  list.Child(track.ByLength());
  const DbChunk root = Parse(Mhbd({Mhsd(1, {list.AsList()})}));
  const DbChunk& mhit = root.children[0].children[0].children[0];
  EXPECT_EQ(mhit.rawRecord.size(), 156u);
  EXPECT_EQ(mhit.U32At(16), 52u);
  ASSERT_EQ(mhit.children.size(), 1u);
  EXPECT_EQ(mhit.children[0].rawRecord.size(), 24u + 16u + 10u);
}

TEST_F(ParseTest, ChildrenComeInFileOrder) {
  RecordBuilder list("mhlt", 92);
  for (std::uint32_t id = 5; id > 0; --id) {
    RecordBuilder track("mhit", 156);
    list.Child(track.U32(16, id).ByLength());
  }
  const DbChunk root = Parse(Mhbd({Mhsd(1, {list.AsList()})}));
  const auto& tracks = root.children[0].children[0].children;
  ASSERT_EQ(tracks.size(), 5u);
  for (std::size_t i = 0; i < 5; ++i) EXPECT_EQ(tracks[i].U32At(16), 5 - i);
}

// A name record of type 2 holds a child only in the photo family; the walk of the enclosing
// container goes on after that child.
Bytes NameRecordWithChild() {
  RecordBuilder mhni("mhni", 76);
  mhni.Child(mkipod::StringMhod(3, u"thumb"));
  return mkipod::RawMhod(2, mhni.ByLength());
}

TEST_F(ParseTest, StringRecordOfType2HasAChildOnlyBelowThePhotoRoot) {
  RecordBuilder image("mhii", 152);
  image.Child(NameRecordWithChild()).Child(mkipod::StringMhod(1, u"after"));
  RecordBuilder images("mhli", 92);
  images.Child(image.ByLength());
  RecordBuilder photoRoot("mhfd", 132);
  photoRoot.Child(images.AsList());
  RecordBuilder musicTrack("mhit", 156);
  musicTrack.Child(mkipod::RawMhod(2, Bytes(40)));
  RecordBuilder tracks("mhlt", 92);
  tracks.Child(musicTrack.ByLength());

  const DbChunk root = Parse(Mhbd({Mhsd(1, {tracks.AsList()}), Mhsd(9, {photoRoot.AsList(20)})}));
  const DbChunk& musicMhod = root.children[0].children[0].children[0].children[0];
  EXPECT_TRUE(musicMhod.children.empty());

  const DbChunk& mhii = root.children[1].children[0].children[0].children[0];
  ASSERT_EQ(mhii.children.size(), 2u);
  const DbChunk& name = mhii.children[0];
  ASSERT_EQ(name.children.size(), 1u);
  EXPECT_EQ(name.children[0].Tag(), kTagMhni);
  ASSERT_EQ(name.children[0].children.size(), 1u);
  EXPECT_EQ(name.children[0].children[0].U32At(12), 3u);
  EXPECT_EQ(mhii.children[1].U32At(12), 1u);  // the sibling after the child's end
}

TEST_F(ParseTest, UnknownTagsKeepOnlyTheirHeader) {
  // The unknown record claims a 40-byte total; only its 16-byte header belongs to it, and the
  // string record behind it is read as the next sibling.
  RecordBuilder unknown("mhzz", 16);
  Bytes unknownBytes = unknown.ByLength();
  StoreU32Le(unknownBytes.data() + 8, 40);
  RecordBuilder track("mhit", 156);
  track.Child(unknownBytes).Child(mkipod::StringMhod(1, u"x"));
  RecordBuilder list("mhlt", 92);
  list.Child(track.ByLength());
  const DbChunk root = Parse(Mhbd({Mhsd(1, {list.AsList()})}));
  const DbChunk& mhit = root.children[0].children[0].children[0];
  ASSERT_EQ(mhit.children.size(), 2u);
  EXPECT_EQ(mhit.children[0].rawRecord.size(), 16u);
  EXPECT_TRUE(mhit.children[0].children.empty());
  EXPECT_EQ(mhit.children[1].Tag(), kTagMhod);
}

TEST_F(ParseTest, RefusesFilesThatEndInsideARecord) {
  const Bytes whole = Mhbd({Mhsd(1, {mkipod::RecordBuilder("mhlt", 92).AsList()})});
  // Inside the first 8 bytes of a record, inside a header, at the end of the data.
  for (std::size_t cut : {std::size_t{3}, std::size_t{50}, std::size_t{104 + 4},
                          std::size_t{104 + 60}, whole.size() - 1}) {
    Bytes truncated(whole.begin(), whole.begin() + static_cast<std::ptrdiff_t>(cut));
    EXPECT_THROW(Parse(truncated), MalformedDatabase) << "cut at " << cut;
  }
}

TEST_F(ParseTest, RefusesStringRecordsCutInsideTheirTotalLength) {
  RecordBuilder track("mhit", 156);
  track.Child(mkipod::StringMhod(1, u"A long enough title"));
  RecordBuilder list("mhlt", 92);
  list.Child(track.ByLength());
  const Bytes whole = Mhbd({Mhsd(1, {list.AsList()})});
  const std::size_t mhodStart = 104 + 96 + 92 + 156;
  for (std::size_t cut : {mhodStart + 10, mhodStart + 30, whole.size() - 2}) {
    Bytes truncated(whole.begin(), whole.begin() + static_cast<std::ptrdiff_t>(cut));
    EXPECT_THROW(Parse(truncated), MalformedDatabase) << "cut at " << cut;
  }
}

TEST_F(ParseTest, RefusesImpossibleLengths) {
  Bytes shortHeader = Mhbd({Mhsd(1)});
  StoreU32Le(shortHeader.data() + 104 + 4, 7);  // a header below 8 bytes
  EXPECT_THROW(Parse(shortHeader), MalformedDatabase);

  Bytes totalBelowHeader = Mhbd({Mhsd(1)});
  StoreU32Le(totalBelowHeader.data() + 104 + 8, 50);
  EXPECT_THROW(Parse(totalBelowHeader), MalformedDatabase);

  Bytes headerPastEnd = Mhbd({Mhsd(1)});
  StoreU32Le(headerPastEnd.data() + 104 + 4, 0x7FFFFFF0);  // never allocated
  EXPECT_THROW(Parse(headerPastEnd), MalformedDatabase);

  Bytes mhodTotalBelowHeader = Mhbd({Mhsd(1, {mkipod::StringMhod(1, u"x")})});
  StoreU32Le(mhodTotalBelowHeader.data() + 104 + 96 + 8, 20);
  EXPECT_THROW(Parse(mhodTotalBelowHeader), MalformedDatabase);

  Bytes countOutsideHeader = Concat({RecordBuilder("mhbd", 16).ByLength()});
  EXPECT_THROW(Parse(countOutsideHeader), MalformedDatabase);

  Bytes moreChildrenThanData = Mhbd({Mhsd(1)});
  StoreU32Le(moreChildrenThanData.data() + 20, 3);
  EXPECT_THROW(Parse(moreChildrenThanData), MalformedDatabase);
}

TEST_F(ParseTest, RefusesNestingBeyondItsLimit) {
  auto nested = [](int depth) {
    Bytes inner = Mhsd(7);
    for (int i = 1; i < depth; ++i) inner = Mhsd(7, {inner});
    return Mhbd({inner});
  };
  EXPECT_NO_THROW(Parse(nested(kMaximumNesting)));
  EXPECT_THROW(Parse(nested(kMaximumNesting + 1)), MalformedDatabase);
}

TEST_F(ParseTest, ReadChunkStopsAtTheHeaderOrAtTheEndOfAStringRecord) {
  const Bytes bytes = Concat({Mhsd(1, {mkipod::StringMhod(1, u"ab")})});
  test::WriteBytes(folder_ / "records", bytes);
  FileHandle file = OpenForReading(folder_ / "records");
  FileChunkReader reader(file.get(), arena_);
  ASSERT_TRUE(reader.ReadChunk().has_value());
  EXPECT_EQ(reader.Tell(), 96);
  const auto mhod = reader.ReadChunk();
  ASSERT_TRUE(mhod.has_value());
  EXPECT_EQ(mhod->size(), 44u);
  EXPECT_EQ(reader.Tell(), 96 + 44);
  EXPECT_FALSE(reader.ReadChunk().has_value());
}

}  // namespace
}  // namespace kestrune::itunesdb
