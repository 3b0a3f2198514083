#include <gpod/itdb.h>
#include <gtest/gtest.h>

#include <string>

#include "base/paths.h"
#include "base/utf.h"
#include "library/track_library.h"
#include "support/temp_folder.h"

namespace kestrune {
namespace {

struct GpodTrack {
  const char* title;
  const char* artist;
  const char* album;
  const char* genre;
  const char* location;
  std::uint32_t lengthMs;
  std::uint32_t size;
};

// Writes a database with libgpod: a master playlist named after the device, every track in it,
// and one more playlist holding the given tracks in reverse.
void WriteWithLibgpod(const std::filesystem::path& file, const std::vector<GpodTrack>& tracks) {
  Itdb_iTunesDB* db = itdb_new();
  Itdb_Playlist* master = itdb_playlist_new("Gpod Device", FALSE);
  itdb_playlist_set_mpl(master);
  itdb_playlist_add(db, master, -1);
  Itdb_Playlist* mix = itdb_playlist_new("Reverse \xE2\x98\x82", FALSE);
  itdb_playlist_add(db, mix, -1);
  std::vector<Itdb_Track*> added;
  for (const GpodTrack& description : tracks) {
    Itdb_Track* track = itdb_track_new();
    track->title = g_strdup(description.title);
    track->artist = g_strdup(description.artist);
    track->album = g_strdup(description.album);
    track->genre = g_strdup(description.genre);
    track->ipod_path = g_strdup(description.location);
    track->tracklen = static_cast<gint32>(description.lengthMs);
    track->size = description.size;
    itdb_track_add(db, track, -1);
    itdb_playlist_add_track(master, track, -1);
    added.push_back(track);
  }
  for (auto it = added.rbegin(); it != added.rend(); ++it) itdb_playlist_add_track(mix, *it, -1);
  std::filesystem::create_directories(file.parent_path());
  GError* error = nullptr;
  const bool written = itdb_write_file(db, file.string().c_str(), &error);
  const std::string message = error != nullptr ? error->message : "";
  if (error != nullptr) g_error_free(error);
  itdb_free(db);
  ASSERT_TRUE(written) << message;
}

TEST(LibgpodDatabase, ReadsBackWhatLibgpodWrote) {
  test::TempFolder folder;
  const std::vector<GpodTrack> tracks = {
      {"Salt on the Window", "The Lantern Keepers", "Harbour Lights", "Folk",
       ":iPod_Control:Music:F00:ABCD.mp3", 185000, 4000000},
      {"Caf\xC3\xA9 \xF0\x9F\x8E\xB5", "Los Hermanos", "Medianoche", "Latin",
       ":iPod_Control:Music:F01:EFGH.m4a", 61000, 123},
      {"No Genre", "Solo", "", "", ":iPod_Control:Music:F02:IJKL.mp3", 999, 1}};
  WriteWithLibgpod(folder / "iPod_Control" / "iTunes" / "iTunesDB", tracks);

  TrackLibrary library(TextFromPath(folder.path()));
  ASSERT_TRUE(library.LoadDatabase());
  EXPECT_EQ(library.deviceName(), u"Gpod Device");
  ASSERT_EQ(library.tracks().size(), tracks.size());
  std::size_t index = 0;
  for (const auto& [id, track] : library.tracks()) {
    const GpodTrack& expected = tracks[index++];
    EXPECT_EQ(track.title, DecodeUtf8(expected.title));
    EXPECT_EQ(track.artist, DecodeUtf8(expected.artist));
    EXPECT_EQ(track.album, DecodeUtf8(expected.album));
    EXPECT_EQ(track.genre, DecodeUtf8(expected.genre));
    EXPECT_EQ(track.mhodText[2], DecodeUtf8(expected.location));
    EXPECT_EQ(track.lengthMs, expected.lengthMs);
    EXPECT_EQ(track.fileSize, expected.size);
  }
  ASSERT_EQ(library.playlists().size(), 1u);
  EXPECT_EQ(library.playlists()[0].name, u"Reverse \u2602");
  EXPECT_EQ(library.playlists()[0].trackIds.size(), tracks.size());
}

}  // namespace
}  // namespace kestrune
