#pragma once

#include <filesystem>
#include <memory>
#include <vector>

#include "platform/drives.h"
#include "platform/files.h"
#include "platform/settings_store.h"
#include "platform/shell.h"

namespace kestrune::platform {

// The drives of this machine, with the given folders listed first as removable drives.
std::unique_ptr<Drives> MakeSystemDrives(
    const std::vector<std::filesystem::path>& foldersFirst = {});

std::unique_ptr<Files> MakeSystemFiles();

// The registry on Windows; the user's settings key file elsewhere.
std::unique_ptr<SettingsStore> MakeSystemSettingsStore();

std::unique_ptr<Shell> MakeSystemShell();

}  // namespace kestrune::platform
