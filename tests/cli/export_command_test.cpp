#include "cli/export_command.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <sstream>

#include "cli/commands.h"
#include "cli/terminal_display.h"
#include "export/settings.h"
#include "platform/fake/fake_shell.h"
#include "platform/fake/memory_settings_store.h"
#include "platform/folder_drives.h"
#include "platform/system.h"
#include "support/devices.h"
#include "support/observed_files.h"
#include "support/temp_folder.h"

namespace kestrune::cli {
namespace {

using ::testing::HasSubstr;

class ExportCommandTest : public ::testing::Test {
 protected:
  void SetUp() override {
    mkipod::DeviceDescription device;
    device.deviceName = u"Pod";
    device.tracks = {test::SimpleTrack(1, u"One", u"Beatles"), test::SimpleTrack(2, u"Two"),
                     test::SimpleTrack(3, u"Three", u"The Beat")};
    device.playlists = {test::SimplePlaylist(u"Mix", {3, 1})};
    mkipod::WriteDevice(device, folder_ / "device");
    drives_.AddFolder(folder_ / "device");
    shell_.folders[platform::SpecialFolder::kMusic] = TextFromPath(folder_ / "music");
  }

  int Export(std::vector<std::u16string> arguments, int stopAtCopy = 0) {
    arguments.insert(arguments.begin(), u"export");
    std::string error;
    const std::optional<Options> options = ParseOptions(arguments, error);
    EXPECT_TRUE(options) << error;
    test::ObservedFiles files;
    files.beforeCopy = [&](int copy) {
      if (copy == stopAtCopy) stop_.Raise();  // as Ctrl+C during that copy
    };
    ExportEnvironment environment{settings_, shell_, files, stop_, false, 80};
    return RunExportCommand(*options, drives_, environment, out_, err_);
  }

  std::u16string Out() const { return TextFromPath(folder_ / "out"); }

  test::TempFolder folder_;
  platform::FolderDrives drives_;
  platform::MemorySettingsStore settings_;
  platform::FakeShell shell_;
  StopRequest stop_;
  std::ostringstream out_, err_;
};

TEST_F(ExportCommandTest, ExportsAPlaylistInItsOrderAndSummarizes) {
  ASSERT_EQ(Export({u"--out", Out(), u"--flat", u"--playlist", u"0"}), kExitOk);
  EXPECT_THAT(out_.str(),
              HasSubstr("Exporting music 1 of 2...... One\nExporting music 2 of 2...... Three\n"
                        "Successfully exported 2 of 2......\nFinished 2 of 2...... Done!\n"));
  EXPECT_THAT(out_.str(), HasSubstr("copied 2, already present 0, failed 0\n"));
  EXPECT_TRUE(std::filesystem::exists(folder_ / "out" / "Three.mp3"));
  EXPECT_FALSE(std::filesystem::exists(folder_ / "out" / "Two.mp3"));
}

TEST_F(ExportCommandTest, SearchesLikeTheWindowAndUsesTheStoredOptions) {
  WriteSetting(settings_, kOrganizedValue, u"false");
  ASSERT_EQ(Export({u"--search", u"BEAT"}), kExitOk);
  const std::filesystem::path proposed = folder_ / "music" / "iTunes" / "iTunes Music";
  EXPECT_TRUE(std::filesystem::exists(proposed / "One.mp3"));
  EXPECT_TRUE(std::filesystem::exists(proposed / "Three.mp3"));
  EXPECT_FALSE(std::filesystem::exists(proposed / "Two.mp3"));
}

TEST_F(ExportCommandTest, AnInterruptStopsAfterTheCurrentFile) {
  EXPECT_EQ(Export({u"--out", Out(), u"--all"}, 2), kExitIncomplete);
  EXPECT_THAT(out_.str(), HasSubstr("Successfully exported 2 of 3......\n"));
  EXPECT_THAT(out_.str(),
              HasSubstr("copied 2, already present 0, failed 0\nstopped after 2 of 3 tracks\n"));
}

TEST_F(ExportCommandTest, RefusalsGiveTheJobsMessagesAndTheirStatuses) {
  EXPECT_EQ(Export({u"--out", Out(), u"--search", u"nothing like it"}), kExitIncomplete);
  EXPECT_THAT(err_.str(),
              HasSubstr("No iPod song selected: No music/video has been selected to export!"));
  EXPECT_EQ(Export({u"--out", u"", u"--all"}), kExitIncomplete);
  EXPECT_THAT(err_.str(), HasSubstr("No output folder: Please specify the output folder!"));
  EXPECT_EQ(Export({u"--out", Out(), u"--ids", u"1,99"}), kExitUsage);
  EXPECT_THAT(err_.str(), HasSubstr("the device has no track 99"));
  EXPECT_EQ(Export({u"--out", Out(), u"--playlist", u"1"}), kExitUsage);
  drives_ = platform::FolderDrives();
  EXPECT_EQ(Export({u"--out", Out(), u"--all"}), kExitNoDevice);
  EXPECT_THAT(
      err_.str(),
      HasSubstr("No iPod Device Found: Make sure you have connected your iPod to your computer!"));
  EXPECT_FALSE(std::filesystem::exists(folder_ / "out"));
}

TEST(TerminalDisplay, RedrawsOneLineWithABarCutToTheTerminal) {
  std::ostringstream out, err;
  TerminalDisplay display({}, true, 40, out, err);
  display.ShowProgress(
      MakeProgress(u"Exporting music ", 1, 4, u"A rather long title that will not fit"));
  display.ShowProgress(MakeProgress(u"Finished ", 4, 4, u"Done!"));
  display.ShowFinish();
  display.ShowMessage(u"first\r\nsecond", u"Title");
  EXPECT_EQ(out.str(),
            "\r[#####               ] Exporting music "  // 39 columns: one less than the terminal
            "\r[####################] Finished 4 of 4.\n");
  EXPECT_EQ(err.str(), "kestrune-cli: Title: first second\n");
}

}  // namespace
}  // namespace kestrune::cli
