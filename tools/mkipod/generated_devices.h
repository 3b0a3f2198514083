#pragma once

#include <cstdint>

#include "mkipod/device_description.h"

namespace kestrune::mkipod {

// The demo device: a few dozen tracks by invented artists on a handful of albums, several
// playlists, and short WAV tones as media so that opening a track plays something.
DeviceDescription DemoDevice();

struct GeneratedDeviceOptions {
  std::uint32_t tracks = 1000;
  std::uint32_t playlists = 10;
  std::uint64_t seed = 1;
  bool media = true;  // write the media files (each `mediaSize` bytes)
  std::uint32_t mediaSize = 64;
};

// A large device of random but believable tracks and playlists, the same for the same options.
DeviceDescription GeneratedDevice(const GeneratedDeviceOptions& options);

}  // namespace kestrune::mkipod
