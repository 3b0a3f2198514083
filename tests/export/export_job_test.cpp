#include "export/export_job.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "base/paths.h"
#include "base/text.h"
#include "export/recording_display.h"
#include "platform/fake/fake_media_library.h"
#include "platform/fake/fake_shell.h"
#include "platform/system.h"
#include "support/devices.h"
#include "support/observed_files.h"
#include "support/temp_folder.h"
#ifndef _WIN32
#include "support/file_size_limit.h"
#endif

namespace kestrune {
namespace {

using ::testing::ElementsAre;
using ::testing::ElementsAreArray;

class ExportJobTest : public ::testing::Test {
 protected:
  void MakeDevice(std::uint32_t trackCount,
                  std::vector<mkipod::PlaylistDescription> playlists = {}) {
    std::vector<mkipod::TrackDescription> tracks;
    for (std::uint32_t id = 1; id <= trackCount; ++id) {
      tracks.push_back(test::SimpleTrack(id, u"Track " + FormatDecimal(id)));
    }
    MakeDevice(std::move(tracks), std::move(playlists));
  }

  void MakeDevice(std::vector<mkipod::TrackDescription> tracks,
                  std::vector<mkipod::PlaylistDescription> playlists) {
    mkipod::DeviceDescription device;
    device.deviceName = u"Pod";
    device.tracks = std::move(tracks);
    device.playlists = std::move(playlists);
    mkipod::WriteDevice(device, folder_ / "device");
    library_.emplace(test::RootOf(folder_ / "device"));
    ASSERT_TRUE(library_->LoadDatabase());
    for (const auto& [id, track] : library_->tracks()) display_.ticked.push_back(track);
    display_.outputFolder = TextFromPath(folder_ / "out");
    display_.organized = false;
  }

  ExportReport Run(bool withDevice = true) {
    ExportReport report;
    RunExport(withDevice ? &*library_ : nullptr, context_, report);
    return report;
  }

  std::vector<std::string> Progress() const { return display_.CallsStartingWith("progress "); }

  // The copying lines of the first tracks, with the bar widths they must show.
  static std::vector<std::string> CopyingLines(std::uint32_t total,
                                               const std::vector<int>& widths) {
    std::vector<std::string> lines;
    for (std::size_t i = 1; i <= widths.size(); ++i) {
      lines.push_back("progress Exporting music " + std::to_string(i) + " of " +
                      std::to_string(total) + "......|" + std::to_string(widths[i - 1]) +
                      "|Track " + std::to_string(i));
    }
    return lines;
  }

  // Halves round up (36.5 is 37, 109.5 is 110), in double precision: 7 ÷ 10 × 365 is just below
  // 255.5 there, so 255.
  const std::vector<int> kTenths = {37, 73, 110, 146, 183, 219, 255, 292, 329, 365};

  std::filesystem::path Out(const std::string& name) const { return folder_ / "out" / name; }

  test::TempFolder folder_;
  std::optional<TrackLibrary> library_;
  test::RecordingDisplay display_;
  test::ObservedFiles files_;
  StopRequest stop_;
  platform::FakeMediaLibrary media_;
  platform::FakeClock clock_;
  ExportContext context_{display_, files_, stop_, {media_, clock_}};
};

TEST_F(ExportJobTest, ChecksTheDeviceFirstThenTheTicksThenTheFolder) {
  MakeDevice(2);
  display_.outputFolder.clear();
  Run(false);
  EXPECT_THAT(display_.calls,
              ElementsAre("form off",
                          "message No iPod Device Found|Make sure you have connected your iPod to "
                          "your computer!",
                          "form on"));
  display_.calls.clear();
  const std::vector<Track> ticked = std::move(display_.ticked);
  display_.ticked.clear();
  Run();
  EXPECT_THAT(
      display_.calls,
      ElementsAre("form off",
                  "message No iPod song selected|No music/video has been selected to export!",
                  "form on"));
  display_.calls.clear();
  display_.ticked = ticked;
  const ExportReport report = Run();
  EXPECT_THAT(display_.calls,
              ElementsAre("form off", "message No output folder|Please specify the output folder!",
                          "form on"));
  EXPECT_FALSE(report.started);
  EXPECT_FALSE(std::filesystem::exists(folder_ / "out"));
}

TEST_F(ExportJobTest, TenTracksCountUpThenFinishWithAFullBarOnTheWorkerThread) {
  MakeDevice(10);
  ExportReport report;
  StartExport(&*library_, context_, report).join();

  std::vector<std::string> expected = CopyingLines(10, kTenths);
  expected.push_back("progress Successfully exported 10 of 10......|365|");
  expected.push_back("progress Finished 10 of 10......|365|Done!");
  EXPECT_THAT(Progress(), ElementsAreArray(expected));
  EXPECT_EQ(display_.calls.front(), "form off");
  EXPECT_EQ(display_.calls.back(), "finish");
  EXPECT_EQ(std::count(display_.calls.begin(), display_.calls.end(), "form on"),
            0);  // until Finish

  ASSERT_EQ(report.copiedFiles.size(), 10u);
  for (const auto& [id, track] : library_->tracks()) {
    const std::filesystem::path copy = Out("Track " + std::to_string(id) + ".mp3");
    EXPECT_EQ(report.copiedFiles[id], TextFromPath(copy));
    EXPECT_EQ(test::ReadBytes(copy), test::ReadBytes(PathFromText(track.devicePath)));
  }
}

TEST_F(ExportJobTest, TerminateDuringTheThirdFileStopsAfterItAndStillSyncsAndFinishes) {
  MakeDevice(10);
  display_.addToItunes = true;
  display_.onProgress = [&](const ProgressView& progress) {
    // Pressed twice: any count is a stop.
    if (progress.titleLine == u"Exporting music 3 of 10......") stop_.Raise(), stop_.Raise();
  };
  const ExportReport report = Run();

  std::vector<std::string> progress = Progress();
  std::vector<std::string> expected = CopyingLines(10, {37, 73, 110});
  expected.push_back("progress Successfully exported 3 of 10......|110|");
  ASSERT_GE(progress.size(), expected.size() + 1);
  EXPECT_THAT(std::vector<std::string>(progress.begin(), progress.begin() + 4),
              ElementsAreArray(expected));
  EXPECT_EQ(progress.back(), "progress Finished 10 of 10......|365|Done!");
  EXPECT_EQ(report.results.size(), 3u);
  EXPECT_TRUE(std::filesystem::exists(Out("Track 3.mp3")));
  EXPECT_FALSE(std::filesystem::exists(Out("Track 4.mp3")));
  EXPECT_EQ(media_.libraryFiles.size(), 3u);

  // The next job starts afresh, whatever was left of the request.
  display_.onProgress = nullptr;
  stop_.Raise();
  EXPECT_EQ(Run().results.size(), 10u);
}

TEST_F(ExportJobTest, EarlierCopiesAreRecordedAndHandedOnWithoutCopying) {
  MakeDevice(4);
  Run();
  ASSERT_EQ(files_.copies, 4);
  display_.calls.clear();
  display_.addToItunes = true;
  const ExportReport second = Run();
  EXPECT_EQ(files_.copies, 4);
  ASSERT_EQ(second.results.size(), 4u);
  for (const TrackResult& result : second.results)
    EXPECT_EQ(result.outcome, CopyOutcome::kAlreadyPresent);
  EXPECT_EQ(second.copiedFiles.size(), 4u);
  EXPECT_EQ(media_.libraryFiles.size(), 4u);
}

TEST_F(ExportJobTest, AMissingDeviceFileIsSkippedSilently) {
  std::vector<mkipod::TrackDescription> tracks = {test::SimpleTrack(1, u"Track 1"),
                                                  test::SimpleTrack(2, u"Track 2"),
                                                  test::SimpleTrack(3, u"Track 3")};
  tracks[1].media = mkipod::MediaKind::kNone;
  MakeDevice(std::move(tracks), {});
  const ExportReport report = Run();
  EXPECT_TRUE(display_.CallsStartingWith("message").empty());
  EXPECT_FALSE(std::filesystem::exists(Out("Track 2.mp3")));
  EXPECT_TRUE(std::filesystem::exists(Out("Track 3.mp3")));
  ASSERT_EQ(report.results.size(), 3u);
  EXPECT_EQ(report.results[1].outcome, CopyOutcome::kFailed);
  EXPECT_EQ(report.results[1].reason, "the file is missing on the device");
  EXPECT_FALSE(report.copiedFiles.contains(2));
  EXPECT_EQ(Progress().back(), "progress Finished 3 of 3......|365|Done!");
}

TEST_F(ExportJobTest, FiveFilesAndTwoPlaylistsThroughTheLibrarySync) {
  MakeDevice(5, {test::SimplePlaylist(u"Mix", {1, 2}), test::SimplePlaylist(u"Solo", {5})});
  display_.addToItunes = true;
  Run();
  std::vector<std::string> expected = CopyingLines(5, {73, 146, 219, 292, 365});
  expected.push_back("progress Successfully exported 5 of 5......|365|");
  expected.push_back("progress Syncing music back to iTunes 1 of 5......|73|Please wait......");
  for (std::uint32_t i = 1; i <= 5; ++i) {
    expected.push_back("progress Adding music to iTunes master playlist " + std::to_string(i) +
                       " of 5......|" + std::to_string(i * 73) + "|Please wait......");
  }
  expected.push_back("progress Rebuilding playlist 1 of 2......|183|Please wait......");
  expected.push_back("progress Rebuilding playlist 2 of 2......|365|Please wait......");
  expected.push_back("progress Finished 5 of 5......|365|Done!");
  EXPECT_THAT(Progress(), ElementsAreArray(expected));
  EXPECT_EQ(media_.programIds, std::vector<std::u16string>{u"iTunes.Application"});
  ASSERT_EQ(media_.playlists.size(), 2u);
  EXPECT_EQ(media_.playlists[1].files,
            std::vector<std::u16string>{TextFromPath(Out("Track 5.mp3"))});
}

TEST_F(ExportJobTest, AnUnwritableTargetFailsEveryCopyButTheJobFinishes) {
  MakeDevice(2);
  test::WriteBytes(folder_ / "out", {1});  // a file where the folder should be
  const ExportReport report = Run();
  ASSERT_EQ(report.results.size(), 2u);
  EXPECT_EQ(report.results[0].outcome, CopyOutcome::kFailed);
  EXPECT_FALSE(report.results[0].reason.empty());
  EXPECT_TRUE(report.copiedFiles.empty());
  EXPECT_EQ(display_.calls.back(), "finish");
  EXPECT_EQ(Progress().back(), "progress Finished 2 of 2......|365|Done!");
}

#ifndef _WIN32
TEST_F(ExportJobTest, ADiskThatFillsUpLeavesNoPartialFile) {
  std::vector<mkipod::TrackDescription> tracks = {test::SimpleTrack(1, u"Track 1"),
                                                  test::SimpleTrack(2, u"Track 2")};
  tracks[0].size = 300000;
  MakeDevice(std::move(tracks), {});
  ExportReport report;
  {
    test::FileSizeLimit full(100000);
    report = Run();
  }
  ASSERT_EQ(report.results.size(), 2u);
  EXPECT_EQ(report.results[0].outcome, CopyOutcome::kFailed);
  EXPECT_EQ(report.results[1].outcome, CopyOutcome::kCopied);
  std::vector<std::string> left;
  for (const auto& entry : std::filesystem::directory_iterator(folder_ / "out")) {
    left.push_back(entry.path().filename().string());
  }
  EXPECT_THAT(left, ElementsAre("Track 2.mp3"));
  EXPECT_EQ(display_.calls.back(), "finish");
}
#endif

}  // namespace
}  // namespace kestrune
