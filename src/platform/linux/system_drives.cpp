#include "platform/linux/mounted_drives.h"
#include "platform/system.h"

namespace kestrune::platform {

std::unique_ptr<Drives> MakeSystemDrives(const std::vector<std::filesystem::path>& foldersFirst) {
  FolderDrives folders;
  for (const auto& folder : foldersFirst) folders.AddFolder(folder);
  return std::make_unique<MountedDrives>("/proc/self/mounts", "/sys/class/block",
                                         std::move(folders));
}

}  // namespace kestrune::platform
