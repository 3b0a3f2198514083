#include "platform/folder_library.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <fstream>

#include "base/paths.h"
#include "support/temp_folder.h"

namespace kestrune::platform {
namespace {

using ::testing::ElementsAre;

// A relative path as the playlist writes it, with the system's separator.
std::string Relative(std::initializer_list<const char*> parts) {
  std::string path;
  for (const char* part : parts)
    path += (path.empty() ? "" : std::string(1, static_cast<char>(kPathSeparator))) + part;
  return path;
}

std::string Text(const std::filesystem::path& path) {
  std::ifstream in(path, std::ios::binary);
  return std::string(std::istreambuf_iterator<char>(in), {});
}

class FolderLibraryTest : public ::testing::Test {
 protected:
  void SetUp() override {
    test::WriteBytes(out_ / "Artist" / "Album" / "Song.mp3", {1, 2, 3});
    song_ = TextFromPath(out_ / "Artist" / "Album" / "Song.mp3");
    created_ = library_.CreateApplication(u"iTunes.Application");
    ASSERT_EQ(created_.result, 0);
  }

  // The user playlists as the library lists them, by name.
  std::vector<std::u16string> Names() {
    std::vector<std::u16string> names;
    auto playlists = created_.application->LibrarySource()->Playlists();
    for (std::int32_t i = 1; i <= playlists->Count(); ++i) {
      auto user = playlists->Item(i)->AsUserPlaylist();
      EXPECT_EQ(user->Smart(), kAutomationFalse);
      names.push_back(user->Name().value());
    }
    return names;
  }

  test::TempFolder folder_;
  std::filesystem::path out_ = folder_ / "out";
  std::u16string song_;
  FolderLibrary library_{out_ / "Playlists",
                         [](std::u16string_view path) -> std::optional<MediaInfo> {
                           if (path.find(u"Song") == std::u16string_view::npos) return std::nullopt;
                           return MediaInfo{u"Art\u00EFst", u"Song\nTitle", 215400};
                         }};
  CreatedApplication created_;
};

TEST_F(FolderLibraryTest, AddingToTheLibraryRecordsExistingFilesWhereTheyAre) {
  auto library = created_.application->LibraryPlaylist();
  auto status = library->AddFile(song_);
  ASSERT_NE(status, nullptr);
  EXPECT_EQ(status->InProgress(), kAutomationFalse);
  auto tracks = status->Tracks();
  ASSERT_EQ(tracks->Count(), 1);
  EXPECT_EQ(tracks->Item(1)->FileLocation(), song_);
  library->AddFile(song_);
  EXPECT_EQ(library->AddFile(TextFromPath(out_ / "missing.mp3")), nullptr);
  EXPECT_THAT(library_.libraryFiles(), ElementsAre(song_));
}

TEST_F(FolderLibraryTest, WritesM3u8WithRelativePathsAndExtendsItNextTime) {
  auto made = created_.application->CreatePlaylist(u"AC/DC Best");
  ASSERT_NE(made, nullptr);
  EXPECT_EQ(made->Kind(), kPlaylistKindUser);
  made->AsUserPlaylist()->AddFile(song_);
  const auto file = out_ / "Playlists" / "AC_DC Best.m3u8";
  EXPECT_EQ(Text(file), "#EXTM3U\n#PLAYLIST:AC/DC Best\n#EXTINF:215,Art\xC3\xAFst - Song Title\n" +
                            Relative({"..", "Artist", "Album", "Song.mp3"}) + "\n");
  EXPECT_THAT(Names(), ElementsAre(u"AC/DC Best"));

  // A later run finds it by its name and only appends.
  auto again = created_.application->LibrarySource()->Playlists()->Item(1)->AsUserPlaylist();
  test::WriteBytes(out_ / "Other.mp3", {1});
  again->AddFile(TextFromPath(out_ / "Other.mp3"));
  EXPECT_EQ(Text(file), "#EXTM3U\n#PLAYLIST:AC/DC Best\n#EXTINF:215,Art\xC3\xAFst - Song Title\n" +
                            Relative({"..", "Artist", "Album", "Song.mp3"}) + "\n" +
                            "#EXTINF:-1,Other\n" + Relative({"..", "Other.mp3"}) + "\n");
}

TEST_F(FolderLibraryTest, ListsPlaylistFilesOfAnyExtensionCaseAndNumbersNewNamesThatClash) {
  std::ofstream(out_ / "Playlists" / "rock.M3U8", std::ios::binary)
      << "#EXTM3U\n../x.mp3";  // no line end at the end
  std::ofstream(out_ / "Playlists" / "notes.txt") << "not a playlist";
  EXPECT_THAT(Names(), ElementsAre(u"rock"));
  // "Rock" would be rock.m3u8 on a file system that ignores case: the new one is numbered.
  auto made = created_.application->CreatePlaylist(u"Rock");
  ASSERT_NE(made, nullptr);
  EXPECT_TRUE(std::filesystem::exists(out_ / "Playlists" / "Rock[0].m3u8"));
  EXPECT_THAT(Names(), ElementsAre(u"Rock", u"rock"));

  auto rock = created_.application->LibrarySource()->Playlists()->Item(2)->AsUserPlaylist();
  ASSERT_EQ(rock->Name(), u"rock");
  rock->AddFile(song_);
  EXPECT_EQ(Text(out_ / "Playlists" / "rock.M3U8"),
            "#EXTM3U\n../x.mp3\n#EXTINF:215,Art\xC3\xAFst - Song Title\n" +
                Relative({"..", "Artist", "Album", "Song.mp3"}) + "\n");
}

TEST(FolderLibrary, CannotBeCreatedWhereNoFolderCanBe) {
  test::TempFolder folder;
  test::WriteBytes(folder / "file", {1});
  FolderLibrary library(folder / "file" / "Playlists");
  const CreatedApplication created = library.CreateApplication(u"iTunes.Application");
  EXPECT_NE(created.result, 0);
  EXPECT_EQ(created.application, nullptr);
}

}  // namespace
}  // namespace kestrune::platform
