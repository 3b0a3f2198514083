#include "library/track_library.h"

#include <gtest/gtest.h>

#include "base/paths.h"
#include "support/devices.h"
#include "support/temp_folder.h"

namespace kestrune {
namespace {

using mkipod::DeviceDescription;
using test::SimplePlaylist;
using test::SimpleTrack;

class TrackLibraryTest : public ::testing::Test {
 protected:
  TrackLibrary Load(const DeviceDescription& device) {
    mkipod::WriteDevice(device, folder_.path());
    TrackLibrary library(test::RootOf(folder_.path()));
    EXPECT_TRUE(library.LoadDatabase());
    return library;
  }

  std::u16string Root() const { return test::RootOf(folder_.path()); }

  test::TempFolder folder_;
};

TEST_F(TrackLibraryTest, BuildsTracksFromTheirRecords) {
  DeviceDescription device;
  device.deviceName = u"My iPod";
  auto track = SimpleTrack(52, u"Caf\u00E9 \U0001F3B5", u"The Band", u"First");
  track.genre = u"Jazz";
  track.lengthMs = 185999;
  track.size = 4000000000u;
  track.media = mkipod::MediaKind::kNone;
  track.moreStrings = {{6, u"Composer"}, {14, u"Fourteen"}};
  device.tracks = {track};

  const TrackLibrary library = Load(device);
  EXPECT_EQ(library.deviceName(), u"My iPod");
  ASSERT_EQ(library.tracks().size(), 1u);
  const Track& loaded = library.tracks().at(52);
  EXPECT_EQ(loaded.trackId, 52u);
  EXPECT_EQ(loaded.title, u"Caf\u00E9 \U0001F3B5");
  EXPECT_EQ(loaded.artist, u"The Band");
  EXPECT_EQ(loaded.album, u"First");
  EXPECT_EQ(loaded.genre, u"Jazz");
  EXPECT_EQ(loaded.lengthMs, 185999u);
  EXPECT_EQ(loaded.lengthText, u"3:05");
  EXPECT_EQ(loaded.fileSize, 4000000000u);
  EXPECT_EQ(loaded.mhodText[0], u"");
  EXPECT_EQ(loaded.mhodText[1], loaded.title);
  EXPECT_EQ(loaded.mhodText[2], u":iPod_Control:Music:F00:TAC.mp3");
  EXPECT_EQ(loaded.mhodText[6], u"Composer");
  EXPECT_EQ(loaded.mhodText[14], u"Fourteen");
  const std::u16string s(1, kPathSeparator);
  EXPECT_EQ(loaded.devicePath,
            Root() + s + u"iPod_Control" + s + u"Music" + s + u"F00" + s + u"TAC.mp3");
  EXPECT_EQ(loaded.rootLength, Root().size());
}

TEST_F(TrackLibraryTest, LaterTrackWithTheSameIdIsKept) {
  DeviceDescription device;
  device.tracks = {SimpleTrack(7, u"first"), SimpleTrack(3, u"other"), SimpleTrack(7, u"second")};
  const TrackLibrary library = Load(device);
  ASSERT_EQ(library.tracks().size(), 2u);
  EXPECT_EQ(library.tracks().at(7).title, u"second");
  EXPECT_EQ(library.tracks().begin()->first, 3u);  // ascending id, whatever the file order
}

TEST_F(TrackLibraryTest, PlaylistsHoldKnownTracksOnceInAscendingId) {
  DeviceDescription device;
  device.deviceName = u"Device";
  device.tracks = {SimpleTrack(10, u"a"), SimpleTrack(20, u"b"), SimpleTrack(30, u"c")};
  device.playlists = {SimplePlaylist(u"Descending", {30, 20, 10, 20}),
                      SimplePlaylist(u"Ghosts", {99, 98}), SimplePlaylist(u"Mixed", {98, 20})};
  mkipod::PlaylistDescription unnamed;
  unnamed.itemIds = {10};
  device.playlists.push_back(unnamed);

  const TrackLibrary library = Load(device);
  ASSERT_EQ(library.playlists().size(), 4u);
  const auto ids = [&library](std::size_t index) {
    std::vector<std::uint32_t> out;
    for (const auto& [key, value] : library.playlists()[index].trackIds) {
      EXPECT_EQ(key, value);
      out.push_back(key);
    }
    return out;
  };
  EXPECT_EQ(library.playlists()[0].name, u"Descending");
  EXPECT_EQ(ids(0), (std::vector<std::uint32_t>{10, 20, 30}));
  EXPECT_EQ(library.playlists()[1].name, u"Ghosts");
  EXPECT_TRUE(ids(1).empty());
  EXPECT_EQ(ids(2), (std::vector<std::uint32_t>{20}));
  EXPECT_EQ(library.playlists()[3].name, u"");
}

TEST_F(TrackLibraryTest, MasterPlaylistsNameTheDeviceAndAreNotListed) {
  DeviceDescription device;
  device.deviceName = u"First master";
  device.tracks = {SimpleTrack(1, u"a")};
  auto second = SimplePlaylist(u"Second master", {1});
  second.master = true;
  device.playlists = {SimplePlaylist(u"Listed", {1}), second};
  const TrackLibrary library = Load(device);
  EXPECT_EQ(library.deviceName(), u"Second master");
  ASSERT_EQ(library.playlists().size(), 1u);
  EXPECT_EQ(library.playlists()[0].name, u"Listed");
}

TEST_F(TrackLibraryTest, NoMasterPlaylistLeavesTheNameEmpty) {
  DeviceDescription device;
  device.tracks = {SimpleTrack(1, u"a")};
  EXPECT_EQ(Load(device).deviceName(), u"");
}

TEST_F(TrackLibraryTest, OtherDataSetsAndUnknownRecordsChangeNothing) {
  DeviceDescription plain;
  plain.deviceName = u"Device";
  plain.tracks = {SimpleTrack(1, u"a"), SimpleTrack(2, u"b")};
  plain.playlists = {SimplePlaylist(u"P", {2, 1})};
  DeviceDescription busy = plain;
  busy.moreDataSets = {{5, false, {}}, {9, true, {}}, {7, false, {{"zzzz", 48}}}};
  busy.tracks[0].unknownRecords = {{"mhxx", 20}};
  busy.tracks[0].rawRecords = {{15, 33}, {100, 7}, {52, 400}};

  const TrackLibrary a = Load(plain);
  test::TempFolder other;
  mkipod::WriteDevice(busy, other.path());
  TrackLibrary b(test::RootOf(other.path()));
  ASSERT_TRUE(b.LoadDatabase());
  ASSERT_EQ(b.tracks().size(), a.tracks().size());
  EXPECT_EQ(b.tracks().at(1).title, u"a");
  EXPECT_EQ(b.tracks().at(1).mhodText[2], a.tracks().at(1).mhodText[2]);
  EXPECT_EQ(b.playlists().size(), 1u);
  EXPECT_EQ(b.playlists()[0].trackIds, a.playlists()[0].trackIds);
  EXPECT_EQ(b.deviceName(), u"Device");
}

TEST_F(TrackLibraryTest, StringsKeepTheirOddLengthsEncodingsAndEmptiness) {
  DeviceDescription device;
  auto odd = SimpleTrack(1, u"abc");
  odd.oddLengthTypes = {1};  // seven bytes: three units and a stray byte
  auto utf8 = SimpleTrack(2, u"Gr\u00FC\u00DFe \U0001F3B5");
  utf8.utf8 = true;
  auto empty = SimpleTrack(3, u"");
  empty.artist = u"";
  empty.album.reset();
  auto twoTitles = SimpleTrack(4, u"first title");
  twoTitles.moreStrings = {{1, u"second title"}};
  auto lone = SimpleTrack(5, std::u16string{u'x', 0xD800});
  device.tracks = {odd, utf8, empty, twoTitles, lone};

  const TrackLibrary library = Load(device);
  EXPECT_EQ(library.tracks().at(1).title, u"abc");
  EXPECT_EQ(library.tracks().at(2).title, u"Gr\u00FC\u00DFe \U0001F3B5");
  EXPECT_EQ(library.tracks().at(2).mhodText[2], u":iPod_Control:Music:F00:TCA.mp3");
  EXPECT_EQ(library.tracks().at(3).title, u"");
  EXPECT_EQ(library.tracks().at(3).artist, u"");
  EXPECT_EQ(library.tracks().at(3).album, u"");
  EXPECT_EQ(library.tracks().at(4).title, u"first title");
  EXPECT_EQ(library.tracks().at(5).title, (std::u16string{u'x', 0xD800}));
}

TEST_F(TrackLibraryTest, LocationsWithoutColonsOrMissingAreAppendedAsTheyStand) {
  DeviceDescription device;
  auto bare = SimpleTrack(1, u"bare");
  bare.location = u"loose.mp3";
  auto none = SimpleTrack(2, u"none");
  none.location.reset();
  device.tracks = {bare, none};
  const TrackLibrary library = Load(device);
  EXPECT_EQ(library.tracks().at(1).devicePath, Root() + u"loose.mp3");
  EXPECT_EQ(library.tracks().at(2).devicePath, Root());
}

TEST(FormatLength, CountsMinutesWithoutLimitAndTwoDigitSeconds) {
  EXPECT_EQ(FormatLength(0), u"0:00");
  EXPECT_EQ(FormatLength(999), u"0:00");
  EXPECT_EQ(FormatLength(59999), u"0:59");
  EXPECT_EQ(FormatLength(60000), u"1:00");
  EXPECT_EQ(FormatLength(65000), u"1:05");
  EXPECT_EQ(FormatLength(3599999), u"59:59");
  EXPECT_EQ(FormatLength(75 * 60000), u"75:00");
  EXPECT_EQ(FormatLength(4294967295u), u"71582:47");
}

}  // namespace
}  // namespace kestrune
