#pragma once

#include <string_view>

#include "mkipod/device_description.h"

namespace kestrune::mkipod {

// Reads the description format of the README; throws std::runtime_error naming the line of a
// mistake.
DeviceDescription ParseDescription(std::string_view text);

}  // namespace kestrune::mkipod
