#pragma once

#include "mkipod/device_description.h"
#include "mkipod/record_builder.h"

namespace kestrune::mkipod {

// The database bytes of a device, laid out as common writers lay them out: "mhbd", then data
// sets 1 (tracks), 3 (playlists again), 2 (playlists) and 4 (albums), then any further sets.
// Track sizes are taken as given (0 when absent).
Bytes BuildDatabase(const DeviceDescription& device);

}  // namespace kestrune::mkipod
