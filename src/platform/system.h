#pragma once

#include <filesystem>
#include <memory>
#include <vector>

#include "platform/drives.h"

namespace kestrune::platform {

// The drives of this machine, with the given folders listed first as removable drives.
std::unique_ptr<Drives> MakeSystemDrives(
    const std::vector<std::filesystem::path>& foldersFirst = {});

}  // namespace kestrune::platform
