#pragma once

#include <cstdint>
#include <cstdio>
#include <map>
#include <string>
#include <vector>

#include "itunesdb/db_chunk.h"
#include "library/track.h"

namespace kestrune {

// Everything loaded from one device's database. Read-only towards the device.
class TrackLibrary {
 public:
  // `rootPath` is the drive string: "E:" on Windows, a mount point or folder elsewhere.
  explicit TrackLibrary(std::u16string rootPath);

  // False when the drive holds no device database (no file, or it is not one). A malformed
  // database throws itunesdb::MalformedDatabase.
  bool LoadDatabase();

  // The same from an open database stream, read from its current position.
  bool ReadDatabase(std::FILE* stream);

  const std::u16string& rootPath() const { return rootPath_; }
  const std::u16string& deviceName() const { return deviceName_; }
  const std::map<std::uint32_t, Track>& tracks() const { return tracks_; }
  const std::vector<Playlist>& playlists() const { return playlists_; }

 private:
  void LoadTracks(const itunesdb::DbChunk& trackList);
  void LoadPlaylists(const itunesdb::DbChunk& playlistList);

  std::u16string rootPath_;
  std::u16string deviceName_;
  std::map<std::uint32_t, Track> tracks_;
  std::vector<Playlist> playlists_;
};

// The text of the first "mhod" child of `node` whose type (u32 at offset 12) is `type`, assigned
// to `text`; false, and `text` untouched, when there is none. Only types 1 to 14 are strings.
bool ReadMhodText(const itunesdb::DbChunk& node, std::uint32_t type, std::u16string& text);

// Minutes (uncapped), ':' and two-digit seconds: 65000 gives "1:05".
std::u16string FormatLength(std::uint32_t milliseconds);

}  // namespace kestrune
