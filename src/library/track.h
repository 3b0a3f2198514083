#pragma once

#include <array>
#include <cstdint>
#include <map>
#include <string>

namespace kestrune {

// One song or video, a value copied whole wherever it is stored.
struct Track {
  std::uint32_t trackId = 0;
  std::uint32_t lengthMs = 0;
  std::uint32_t fileSize = 0;
  // Entry N is the text of the track's first string record of type N; entry 0 stays empty.
  std::array<std::u16string, 15> mhodText;
  // The drive followed by the location with every ':' turned into the platform's separator.
  std::u16string devicePath;
  std::u16string title;
  std::u16string artist;
  std::u16string album;
  std::u16string genre;
  std::u16string lengthText;
  // How many leading units of devicePath name the drive, so that the file can be found below
  // the drive and never outside it.
  std::uint32_t rootLength = 0;
};

// A playlist of the device other than the master playlist. Each track at most once, in
// ascending id; key and value are both the track id.
struct Playlist {
  std::u16string name;
  std::map<std::uint32_t, std::uint32_t> trackIds;
};

// Location text of a track as a path below its drive.
inline constexpr std::size_t kLocationMhod = 2;
inline constexpr std::size_t kTitleMhod = 1;
inline constexpr std::size_t kAlbumMhod = 3;
inline constexpr std::size_t kArtistMhod = 4;
inline constexpr std::size_t kGenreMhod = 5;

}  // namespace kestrune
