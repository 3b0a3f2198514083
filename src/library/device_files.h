#pragma once

#include <cstddef>
#include <filesystem>
#include <optional>
#include <string_view>

#include "library/track.h"

namespace kestrune {

// True when the part of `path` after its first `rootLength` units starts with a separator and
// has no component that climbs out (".." and, since Windows trims trailing dots and spaces from
// names, any name of only dots and spaces holding two dots or more).
bool StaysInsideDrive(std::u16string_view path, std::size_t rootLength);

// The existing file or folder that `path` names below the drive formed by its first
// `rootLength` units. When the path does not exist exactly, each component below the drive is
// matched without regard to ASCII letter case, as devices formatted elsewhere may be mounted
// case-sensitively. Empty when nothing matches or the path would leave the drive.
std::optional<std::filesystem::path> FindBelowDrive(std::u16string_view path,
                                                    std::size_t rootLength);

// The track's file on the device, or empty when it counts as missing.
std::optional<std::filesystem::path> LocateTrackFile(const Track& track);

}  // namespace kestrune
