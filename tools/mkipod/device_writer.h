#pragma once

#include <filesystem>

#include "mkipod/device_description.h"
#include "mkipod/record_builder.h"

namespace kestrune::mkipod {

// Writes the device folder: every track's media file at its location (locations that do not
// start with ':' or that climb out with ".." get no file), then the database with each missing
// size filled from the media file. Returns the description as written.
DeviceDescription WriteDevice(DeviceDescription device, const std::filesystem::path& folder);

// Where a location puts its file below the device folder; empty for locations that get no file.
std::filesystem::path MediaPathFor(const std::u16string& location,
                                   const std::filesystem::path& folder);

void WriteFile(const std::filesystem::path& path, const Bytes& bytes);

}  // namespace kestrune::mkipod
