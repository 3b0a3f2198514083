#pragma once

#include <cstdint>
#include <map>
#include <string_view>
#include <vector>

#include "library/track.h"

namespace kestrune {

// The window's search: the text, upper-cased in a to z only, occurs in the track's title,
// artist, album and genre joined with nothing between them (so a match may span two fields),
// also upper-cased in a to z only. Every track of the device, in ascending id. The window
// ignores an empty text before it gets here.
std::vector<Track> SearchTracks(const std::map<std::uint32_t, Track>& tracks,
                                std::u16string_view text);

}  // namespace kestrune
