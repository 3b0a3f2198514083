#pragma once

#include <optional>
#include <string>
#include <vector>

#include "library/track_library.h"
#include "platform/drives.h"

namespace kestrune {

// Appends the drives that may hold a device, in the platform's order: removable drives other
// than A: and B:, as drive strings without a trailing separator, drive letters upper-cased.
void ListRemovableDrives(const platform::Drives& drives, std::vector<std::u16string>& list);

// The library of the first candidate drive whose database loads. A malformed database, or any
// other failure while searching, ends the search with nothing found; `failure` then says why.
std::optional<TrackLibrary> FindDevice(const platform::Drives& drives,
                                       std::string* failure = nullptr);

}  // namespace kestrune
