#include "export/library_sync.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "base/paths.h"
#include "export/recording_display.h"
#include "platform/fake/fake_media_library.h"
#include "platform/fake/fake_shell.h"
#include "platform/fake/memory_settings_store.h"
#include "platform/system.h"
#include "support/temp_folder.h"

namespace kestrune {
namespace {

using platform::FakeMediaLibrary;
using ::testing::ElementsAre;
using ::testing::IsEmpty;

Playlist MakePlaylist(std::u16string name, std::initializer_list<std::uint32_t> ids) {
  Playlist playlist{std::move(name), {}};
  for (std::uint32_t id : ids) playlist.trackIds.emplace(id, id);
  return playlist;
}

class LibrarySyncTest : public ::testing::Test {
 protected:
  void Sync(std::vector<Playlist> playlists = {}) {
    SyncToItunes(copied_, playlists, display_, context_);
  }

  FakeMediaLibrary::Playlist& PlaylistNamed(std::u16string_view name) {
    for (auto& playlist : media_.playlists) {
      if (playlist.name == name && !playlist.smart) return playlist;
    }
    throw std::runtime_error("no such playlist");
  }

  CopiedFiles copied_ = {{1, u"/out/one.mp3"}, {2, u"/out/two.mp3"}, {3, u"/out/three.mp3"}};
  test::RecordingDisplay display_;
  FakeMediaLibrary media_;
  platform::FakeShell shell_;
  platform::MemorySettingsStore settings_;
  std::unique_ptr<platform::Files> files_ = platform::MakeSystemFiles();
  platform::FakeClock clock_;
  LibraryLauncher launcher_{shell_, settings_, *files_};
  LibrarySyncContext context_{media_, clock_, &launcher_};
};

TEST_F(LibrarySyncTest, AddsEveryCopyThenFillsPlaylistsWithWhereTheLibraryKeepsThem) {
  media_.relocations[u"/out/two.mp3"] = u"/library/two.mp3";
  Sync({MakePlaylist(u"Mix", {1, 2, 9})});
  EXPECT_THAT(media_.libraryFiles,
              ElementsAre(u"/out/one.mp3", u"/out/two.mp3", u"/out/three.mp3"));
  EXPECT_EQ(copied_[2], u"/library/two.mp3");
  EXPECT_THAT(PlaylistNamed(u"Mix").files, ElementsAre(u"/out/one.mp3", u"/library/two.mp3"));
}

TEST_F(LibrarySyncTest, ASmartPlaylistOfTheSameNameIsLeftAloneAndANewOneMade) {
  media_.playlists.push_back({u"Mix", platform::kPlaylistKindUser, true, {}});
  media_.playlists.push_back({u"Mix", platform::kPlaylistKindLibrary, false, {}});
  Sync({MakePlaylist(u"Mix", {1})});
  EXPECT_THAT(media_.createdPlaylists, ElementsAre(u"Mix"));
  EXPECT_THAT(media_.playlists[0].files, IsEmpty());
  EXPECT_THAT(media_.playlists[1].files, IsEmpty());
  EXPECT_THAT(media_.playlists[2].files, ElementsAre(u"/out/one.mp3"));
}

TEST_F(LibrarySyncTest, ANameDifferingOnlyInLetterCaseIsReusedAndAnEmptyOneStillMade) {
  media_.playlists.push_back({u"rOCK", platform::kPlaylistKindUser, false, {u"/old.mp3"}});
  Sync({MakePlaylist(u"Rock", {3}), MakePlaylist(u"Nothing copied", {42})});
  EXPECT_THAT(media_.playlists[0].files, ElementsAre(u"/old.mp3", u"/out/three.mp3"));
  EXPECT_THAT(media_.createdPlaylists, ElementsAre(u"Nothing copied"));
  EXPECT_THAT(PlaylistNamed(u"Nothing copied").files, IsEmpty());
}

TEST_F(LibrarySyncTest, AMissingLibraryGivesOneMessageAndStopsAtTheOpeningStep) {
  media_.createResult = static_cast<std::int32_t>(0x800401F3);
  Sync({MakePlaylist(u"Mix", {1})});
  EXPECT_THAT(
      display_.calls,
      ElementsAre(
          "progress Syncing music back to iTunes 1 of 3......|122|Please wait......",
          "message iTunes not found!|Failed to sync music/video/playlist back to iTunes.\r\n"
          "Please make sure you have iTunes installed on your computer!"));
  EXPECT_THAT(media_.libraryFiles, IsEmpty());
}

TEST_F(LibrarySyncTest, WithoutTheLibraryPlaylistThePlaylistsGetTheCopiedPaths) {
  media_.refuseLibraryPlaylist = true;
  media_.relocations[u"/out/one.mp3"] = u"/library/one.mp3";
  Sync({MakePlaylist(u"Mix", {1})});
  EXPECT_TRUE(display_.CallsStartingWith("progress Adding").empty());
  EXPECT_THAT(PlaylistNamed(u"Mix").files, ElementsAre(u"/out/one.mp3"));
}

TEST_F(LibrarySyncTest, FilesTheLibraryRefusesOrCannotReportKeepTheirPaths) {
  media_.refusedFiles = {u"/out/one.mp3"};
  media_.relocations = {{u"/out/two.mp3", u"/library/two.mp3"},
                        {u"/out/three.mp3", u"/library/three.mp3"}};
  media_.trackCounts[u"/out/two.mp3"] = 2;
  media_.oddProgress[u"/out/three.mp3"] = 1;
  Sync();
  EXPECT_EQ(copied_,
            (CopiedFiles{{1, u"/out/one.mp3"}, {2, u"/out/two.mp3"}, {3, u"/out/three.mp3"}}));
}

TEST_F(LibrarySyncTest, AnOperationIsWaitedForUpToAMinuteThenPassedOver) {
  media_.relocations = {{u"/out/one.mp3", u"/library/one.mp3"},
                        {u"/out/two.mp3", u"/library/two.mp3"}};
  media_.busyReads[u"/out/one.mp3"] = 5999;  // done just inside the minute of 10 ms pauses
  media_.busyReads[u"/out/two.mp3"] = -1;    // never done
  Sync();
  EXPECT_EQ(copied_[1], u"/library/one.mp3");
  EXPECT_EQ(copied_[2], u"/out/two.mp3");
  EXPECT_EQ(clock_.pauses, 5999 + 6000);
  EXPECT_THAT(media_.libraryFiles,
              ElementsAre(u"/out/one.mp3", u"/out/two.mp3", u"/out/three.mp3"));
}

TEST_F(LibrarySyncTest, PlaylistsThatCanNeitherBeFoundNorMadeArePassedOver) {
  media_.refusePlaylists = true;
  media_.refuseCreatePlaylist = true;
  Sync({MakePlaylist(u"Mix", {1}), MakePlaylist(u"Other", {2})});
  EXPECT_EQ(display_.CallsStartingWith("progress Rebuilding").size(), 2u);
  EXPECT_THAT(media_.playlists, IsEmpty());
}

class LaunchTest : public LibrarySyncTest {
 protected:
  void SetUp() override {
    programFiles_ = TextFromPath(folder_.path());
    shell_.folders[platform::SpecialFolder::kProgramFiles] = programFiles_;
  }
  test::TempFolder folder_;
  std::u16string programFiles_;
};

TEST_F(LaunchTest, StartsTheExecutableBelowProgramFilesQuoted) {
  const std::u16string exe = programFiles_ + u"\\iTunes\\iTunes.exe";
  test::WriteBytes(PathFromText(exe), {1});
  LaunchItunes(launcher_);
  EXPECT_THAT(shell_.runs, ElementsAre(u"\"" + exe + u"\""));
}

TEST_F(LaunchTest, TheSyncStartsTheProgramOnlyWhenGivenALauncher) {
  test::WriteBytes(PathFromText(programFiles_ + u"\\iTunes\\iTunes.exe"), {1});
  Sync();
  EXPECT_EQ(shell_.runs.size(), 1u);
  context_.launcher = nullptr;
  Sync();
  EXPECT_EQ(shell_.runs.size(), 1u);
}

TEST_F(LaunchTest, FallsBackToTheAppPathsEntryAndRunsNothingThatIsNotThere) {
  const std::u16string elsewhere = TextFromPath(folder_ / "elsewhere.exe");
  settings_.SetValue(platform::RegistryRoot::kLocalMachine, kLibraryAppPathsKey, u"",
                     {platform::kRegSz, platform::StringValueBytes(elsewhere)});
  LaunchItunes(launcher_);
  EXPECT_THAT(shell_.runs, IsEmpty());
  test::WriteBytes(PathFromText(elsewhere), {1});
  LaunchItunes(launcher_);
  EXPECT_THAT(shell_.runs, ElementsAre(u"\"" + elsewhere + u"\""));
  shell_.folders.clear();
  LaunchItunes(launcher_);
  EXPECT_EQ(shell_.runs.size(), 1u);
}

}  // namespace
}  // namespace kestrune
