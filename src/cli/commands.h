#pragma once

#include <ostream>

#include "cli/options.h"
#include "platform/drives.h"

namespace kestrune::cli {

// Exit statuses of the commands.
inline constexpr int kExitOk = 0;
inline constexpr int kExitNoDevice = 2;
inline constexpr int kExitUsage = 64;

// Every candidate drive and what its database gave; 0 when a device would be loaded.
int RunDevices(const platform::Drives& drives, std::ostream& out, std::ostream& err);

// The device the search finds, as a table or as JSON; 0 when a device was loaded.
int RunList(const Options& options, const platform::Drives& drives, std::ostream& out,
            std::ostream& err);

}  // namespace kestrune::cli
