#include "cli/commands.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <sstream>

#include "cli/json_writer.h"
#include "platform/folder_drives.h"
#include "support/devices.h"
#include "support/temp_folder.h"

namespace kestrune::cli {
namespace {

using ::testing::HasSubstr;

TEST(JsonString, EscapesWhatJsonRequiresAndKeepsEveryUnit) {
  EXPECT_EQ(JsonString(u"plain"), "\"plain\"");
  EXPECT_EQ(JsonString(u"a\"b\\c\nd\te\x01"), "\"a\\\"b\\\\c\\nd\\te\\u0001\"");
  EXPECT_EQ(JsonString(u"Caf\u00E9 \U0001F3B5"), "\"Caf\xC3\xA9 \xF0\x9F\x8E\xB5\"");
  EXPECT_EQ(JsonString(std::u16string{u'x', 0xD800}), "\"x\\ud800\"");
  EXPECT_EQ(JsonString(std::u16string{0xDC00, 0xD800}), "\"\\udc00\\ud800\"");
}

class CommandsTest : public ::testing::Test {
 protected:
  void SetUp() override {
    mkipod::DeviceDescription device;
    device.deviceName = u"Pod \"One\"";
    device.tracks = {test::SimpleTrack(53, u"Second"), test::SimpleTrack(52, u"First")};
    device.tracks[0].title = std::u16string{u'S', 0xDC01};
    device.playlists = {test::SimplePlaylist(u"Mix", {53, 52}),
                        test::SimplePlaylist(u"Solo", {53})};
    mkipod::WriteDevice(device, folder_ / "device");
    drives_.AddFolder(folder_ / "device");
  }

  int Run(Options options) { return RunList(options, drives_, out_, err_); }

  test::TempFolder folder_;
  platform::FolderDrives drives_;
  std::ostringstream out_, err_;
};

TEST_F(CommandsTest, ListsJsonInAscendingIdWithPlaylistsInOrder) {
  Options options;
  options.json = true;
  ASSERT_EQ(Run(options), kExitOk);
  const std::string json = out_.str();
  EXPECT_THAT(
      json,
      HasSubstr(
          "{\"device\": \"Pod \\\"One\\\"\", \"tracks\": [\n{\"id\": 52, \"title\": \"First\", "
          "\"artist\": \"Artist\", \"album\": \"Album\", \"genre\": \"Genre\", "
          "\"length_ms\": 52000, \"length\": \"0:52\", \"size\": 152, \"path\": "));
  EXPECT_LT(json.find("\"id\": 52"), json.find("\"id\": 53"));
  EXPECT_THAT(json, HasSubstr("\"title\": \"S\\udc01\""));
  EXPECT_THAT(json, HasSubstr("\"playlists\": [\n{\"name\": \"Mix\", \"track_ids\": [52, 53]},\n"
                              "{\"name\": \"Solo\", \"track_ids\": [53]}\n]}"));
}

TEST_F(CommandsTest, ListsOnePlaylistsTracks) {
  Options options;
  options.json = true;
  options.playlist = 1;
  ASSERT_EQ(Run(options), kExitOk);
  EXPECT_EQ(out_.str().find("\"id\": 52,"), std::string::npos);
  EXPECT_THAT(out_.str(), HasSubstr("\"id\": 53,"));
  options.playlist = 2;
  EXPECT_EQ(Run(options), kExitUsage);
  EXPECT_THAT(err_.str(), HasSubstr("no playlist 2"));
}

TEST_F(CommandsTest, ListsATableWithASummary) {
  ASSERT_EQ(Run(Options{}), kExitOk);
  EXPECT_THAT(out_.str(), HasSubstr("ID  TITLE"));
  EXPECT_THAT(out_.str(), HasSubstr("playlist 1: \"Solo\", 1 tracks"));
  EXPECT_THAT(out_.str(), HasSubstr(": 2 tracks, 2 playlists, 0:01:45, 305 bytes"));
}

TEST_F(CommandsTest, NoDeviceExitsWithTwoAndOneLine) {
  platform::FolderDrives nothing;
  nothing.AddFolder(folder_ / "absent");
  EXPECT_EQ(RunList(Options{}, nothing, out_, err_), kExitNoDevice);
  EXPECT_EQ(err_.str(), "kestrune-cli: no device found\n");
}

TEST_F(CommandsTest, DevicesShowsEveryCandidateAndTheOneLoaded) {
  drives_.AddFolder(folder_ / "absent");
  std::ostringstream out, err;
  EXPECT_EQ(RunDevices(drives_, out, err), kExitOk);
  EXPECT_THAT(out.str(), HasSubstr("loaded  \"Pod \\\"One\\\"\": 2 tracks"));
  EXPECT_THAT(out.str(), HasSubstr("(the device)"));
  EXPECT_THAT(out.str(), HasSubstr("absent  no database"));
}

}  // namespace
}  // namespace kestrune::cli
