#include "library/device_files.h"

#include <gtest/gtest.h>

#include "base/paths.h"
#include "library/track_library.h"
#include "support/devices.h"
#include "support/temp_folder.h"

namespace kestrune {
namespace {

std::u16string Native(std::u16string text) {
  for (char16_t& unit : text) {
    if (unit == u'/') unit = kPathSeparator;
  }
  return text;
}

TEST(StaysInsideDrive, RefusesPathsThatClimbOut) {
  EXPECT_TRUE(StaysInsideDrive(Native(u"E:/iPod_Control/Music/a.mp3"), 2));
  EXPECT_TRUE(StaysInsideDrive(Native(u"E:/Music/a..b.mp3"), 2));
  EXPECT_TRUE(StaysInsideDrive(Native(u"E:/./Music/.hidden"), 2));
  EXPECT_FALSE(StaysInsideDrive(Native(u"E:/Music/../../etc/passwd"), 2));
  EXPECT_FALSE(StaysInsideDrive(Native(u"E:/.."), 2));
  EXPECT_FALSE(StaysInsideDrive(Native(u"E:/Music/.. /x"), 2));
  EXPECT_FALSE(StaysInsideDrive(Native(u"E:/Music/.../x"), 2));
  EXPECT_FALSE(StaysInsideDrive(u"E:loose.mp3", 2));  // no separator after the drive
  EXPECT_FALSE(StaysInsideDrive(u"E:", 2));
  EXPECT_FALSE(StaysInsideDrive(u"E", 2));
#ifndef _WIN32
  EXPECT_FALSE(StaysInsideDrive(u"/media/ipod/Music/../../../etc/passwd", 11));
  EXPECT_TRUE(StaysInsideDrive(u"/media/ipod/Music\\..\\x", 11));  // a backslash is a letter here
#else
  EXPECT_FALSE(StaysInsideDrive(u"E:\\Music/../../x", 2));
#endif
}

class DeviceFilesTest : public ::testing::Test {
 protected:
  Track Loaded(mkipod::TrackDescription track) {
    mkipod::DeviceDescription device;
    device.tracks = {std::move(track)};
    mkipod::WriteDevice(device, device_);
    TrackLibrary library(test::RootOf(device_));
    EXPECT_TRUE(library.LoadDatabase());
    return library.tracks().begin()->second;
  }

  test::TempFolder folder_;
  std::filesystem::path device_ = folder_ / "device";
};

TEST_F(DeviceFilesTest, FindsTheTracksFile) {
  const Track track = Loaded(test::SimpleTrack(1, u"a"));
  const auto file = LocateTrackFile(track);
  ASSERT_TRUE(file.has_value());
  EXPECT_EQ(*file, device_ / "iPod_Control" / "Music" / "F00" / "TBA.mp3");
}

TEST_F(DeviceFilesTest, LocationsThatClimbOutCountAsMissing) {
  test::WriteBytes(folder_ / "outside.mp3", {1, 2, 3});
  auto track = test::SimpleTrack(1, u"escape");
  track.location = u":..:outside.mp3";
  EXPECT_FALSE(LocateTrackFile(Loaded(track)).has_value());
}

TEST_F(DeviceFilesTest, AbsentFilesCountAsMissing) {
  auto track = test::SimpleTrack(1, u"gone");
  track.media = mkipod::MediaKind::kNone;
  EXPECT_FALSE(LocateTrackFile(Loaded(track)).has_value());
}

TEST_F(DeviceFilesTest, LetterCaseOfTheDeviceMayDifferFromTheDatabase) {
  auto track = test::SimpleTrack(1, u"shouting");
  track.location = u":IPOD_CONTROL:MUSIC:F00:tba.MP3";
  track.media = mkipod::MediaKind::kNone;
  test::WriteBytes(device_ / "iPod_Control" / "Music" / "F00" / "TBA.mp3", {1});
  const auto file = LocateTrackFile(Loaded(track));
  ASSERT_TRUE(file.has_value());
  EXPECT_TRUE(
      std::filesystem::equivalent(*file, device_ / "iPod_Control" / "Music" / "F00" / "TBA.mp3"));
}

TEST_F(DeviceFilesTest, TheDatabaseIsFoundInAFolderOfOtherLetterCase) {
  mkipod::DeviceDescription device;
  device.tracks = {test::SimpleTrack(1, u"a")};
  test::TempFolder written;
  mkipod::WriteDevice(device, written.path());
  const auto bytes = test::ReadBytes(written / "iPod_Control" / "iTunes" / "iTunesDB");
  test::WriteBytes(device_ / "IPOD_CONTROL" / "ITUNES" / "ITUNESDB", bytes);
  TrackLibrary library(test::RootOf(device_));
  EXPECT_TRUE(library.LoadDatabase());
  EXPECT_EQ(library.tracks().size(), 1u);
}

}  // namespace
}  // namespace kestrune
