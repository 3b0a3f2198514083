#include "view/track_search.h"

#include "base/text.h"

namespace kestrune {

std::vector<Track> SearchTracks(const std::map<std::uint32_t, Track>& tracks,
                                std::u16string_view text) {
  const std::u16string wanted = AsciiUpper(text);
  std::vector<Track> found;
  std::u16string hay;
  for (const auto& [id, track] : tracks) {
    hay = track.title;
    hay += track.artist;
    hay += track.album;
    hay += track.genre;
    if (AsciiUpper(hay).find(wanted) != std::u16string::npos) found.push_back(track);
  }
  return found;
}

}  // namespace kestrune
