#include <gtest/gtest.h>

#include "base/bytes.h"
#include "itunesdb/record_format.h"
#include "library/track_library.h"
#include "mkipod/record_builder.h"
#include "support/devices.h"
#include "support/temp_folder.h"

namespace kestrune {
namespace {

using itunesdb::MalformedDatabase;
using mkipod::Bytes;
using mkipod::RecordBuilder;

Bytes Set(std::uint32_t type, std::initializer_list<Bytes> children) {
  RecordBuilder mhsd("mhsd", 96);
  mhsd.U32(12, type);
  for (const Bytes& child : children) mhsd.Child(child);
  return mhsd.ByLength();
}

Bytes List(const char* tag, std::initializer_list<Bytes> children) {
  RecordBuilder list(tag, 92);
  for (const Bytes& child : children) list.Child(child);
  return list.AsList();
}

Bytes Database(std::initializer_list<Bytes> sets) {
  RecordBuilder mhbd("mhbd", 104);
  for (const Bytes& set : sets) mhbd.Child(set);
  return mhbd.AsList(20);
}

Bytes Track(std::uint32_t headerLength, std::initializer_list<Bytes> strings = {}) {
  RecordBuilder mhit("mhit", headerLength);
  for (const Bytes& string : strings) mhit.Child(string);
  return mhit.ByLength();
}

Bytes Playlist(std::uint32_t headerLength, std::initializer_list<Bytes> items = {}) {
  RecordBuilder mhyp("mhyp", headerLength);
  for (const Bytes& item : items) mhyp.Child(item);
  return mhyp.ByLength();
}

class MalformedDatabaseTest : public ::testing::Test {
 protected:
  bool Load(const Bytes& database) {
    test::WriteBytes(folder_ / "iPod_Control" / "iTunes" / "iTunesDB", database);
    TrackLibrary library(test::RootOf(folder_.path()));
    return library.LoadDatabase();
  }

  test::TempFolder folder_;
};

TEST_F(MalformedDatabaseTest, DrivesWithoutADatabaseAreNoDevice) {
  TrackLibrary library(test::RootOf(folder_.path()));
  EXPECT_FALSE(library.LoadDatabase());
  EXPECT_FALSE(Load({}));  // an empty placeholder file
  EXPECT_FALSE(Load(RecordBuilder("mhfd", 132).AsList(20)));
  EXPECT_FALSE(Load(RecordBuilder("MHBD", 104).ByLength()));
}

TEST_F(MalformedDatabaseTest, AWellFormedMinimalDatabaseLoads) {
  EXPECT_TRUE(Load(Database({Set(1, {List("mhlt", {})}), Set(2, {List("mhlp", {})})})));
}

TEST_F(MalformedDatabaseTest, MissingSetsOrListsAreMalformed) {
  EXPECT_THROW(Load(Database({Set(2, {List("mhlp", {})})})), MalformedDatabase);
  EXPECT_THROW(Load(Database({Set(1, {List("mhlt", {})})})), MalformedDatabase);
  EXPECT_THROW(Load(Database({Set(1, {}), Set(2, {List("mhlp", {})})})), MalformedDatabase);
  EXPECT_THROW(Load(Database({Set(1, {List("mhlt", {})}), Set(2, {})})), MalformedDatabase);
}

TEST_F(MalformedDatabaseTest, TheLastSetOfATypeCounts) {
  const Bytes emptyTracks = Set(1, {List("mhlt", {})});
  EXPECT_THROW(Load(Database({emptyTracks, Set(2, {List("mhlp", {})}), Set(1, {})})),
               MalformedDatabase);
  EXPECT_TRUE(Load(Database({Set(1, {}), Set(2, {List("mhlp", {})}), emptyTracks})));
}

TEST_F(MalformedDatabaseTest, RecordsTooShortForTheirFieldsAreMalformed) {
  const Bytes playlists = Set(2, {List("mhlp", {})});
  EXPECT_THROW(Load(Database({Set(1, {List("mhlt", {Track(40)})}), playlists})), MalformedDatabase);
  EXPECT_NO_THROW(Load(Database({Set(1, {List("mhlt", {Track(44)})}), playlists})));

  const Bytes tracks = Set(1, {List("mhlt", {})});
  EXPECT_THROW(Load(Database({tracks, Set(2, {List("mhlp", {Playlist(20)})})})), MalformedDatabase);
  const Bytes shortItem = RecordBuilder("mhip", 24).ByLength();
  EXPECT_THROW(Load(Database({tracks, Set(2, {List("mhlp", {Playlist(184, {shortItem})})})})),
               MalformedDatabase);
  RecordBuilder shortSet("mhsd", 12);
  EXPECT_THROW(Load(Database({shortSet.ByLength()})), MalformedDatabase);
}

TEST_F(MalformedDatabaseTest, StringsRunningPastTheirRecordAreMalformed) {
  Bytes title = mkipod::StringMhod(1, u"Title");
  StoreU32Le(title.data() + itunesdb::kMhodStringLengthOffset, 12);  // two bytes too many
  const Bytes playlists = Set(2, {List("mhlp", {})});
  EXPECT_THROW(Load(Database({Set(1, {List("mhlt", {Track(156, {title})})}), playlists})),
               MalformedDatabase);
  // A record of another layout is never read as a string, whatever its offset 28 holds.
  Bytes address = mkipod::RawMhod(15, Bytes(20, 0xFF));
  EXPECT_TRUE(Load(Database({Set(1, {List("mhlt", {Track(156, {address})})}), playlists})));
}

TEST_F(MalformedDatabaseTest, AFileShorterThanOneRecordHeaderIsMalformed) {
  EXPECT_THROW(Load({'m', 'h', 'b'}), MalformedDatabase);
}

}  // namespace
}  // namespace kestrune
