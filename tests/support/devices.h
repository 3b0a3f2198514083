#pragma once

#include <filesystem>
#include <initializer_list>
#include <string>

#include "base/paths.h"
#include "mkipod/device_description.h"
#include "mkipod/device_writer.h"

namespace kestrune::test {

// A track as most tests want it: strings, a location in the usual folder, a small media file.
inline mkipod::TrackDescription SimpleTrack(std::uint32_t id, std::u16string title,
                                            std::u16string artist = u"Artist",
                                            std::u16string album = u"Album") {
  mkipod::TrackDescription track;
  track.id = id;
  track.title = std::move(title);
  track.artist = std::move(artist);
  track.album = std::move(album);
  track.genre = u"Genre";
  track.location = u":iPod_Control:Music:F00:T" +
                   std::u16string(1, static_cast<char16_t>(u'A' + id % 26)) +
                   std::u16string(1, static_cast<char16_t>(u'A' + id / 26 % 26)) + u".mp3";
  track.lengthMs = 1000 * id;
  track.size = 100 + id;
  return track;
}

inline mkipod::PlaylistDescription SimplePlaylist(std::u16string name,
                                                  std::initializer_list<std::uint32_t> ids) {
  mkipod::PlaylistDescription playlist;
  playlist.name = std::move(name);
  playlist.itemIds = ids;
  playlist.positions = true;
  return playlist;
}

// The drive string a library made for `folder` gets.
inline std::u16string RootOf(const std::filesystem::path& folder) { return TextFromPath(folder); }

}  // namespace kestrune::test
