#pragma once

#include <filesystem>
#include <string>
#include <vector>

#include "platform/drives.h"
#include "platform/folder_drives.h"

namespace kestrune::platform {

// The mounted volumes of a Linux machine as drives. A volume counts as removable when the kernel
// flags its disk removable, or when it is mounted under /media or /run/media, where desktops mount
// the volumes a user plugs in. Other mounts of block devices are listed as fixed disks; virtual
// file systems are not listed at all. The folders given first are listed before every volume.
class MountedDrives : public Drives {
 public:
  MountedDrives(std::filesystem::path mountTable, std::filesystem::path sysClassBlock,
                FolderDrives foldersFirst);

  std::u16string LogicalDriveStrings() const override;
  unsigned DriveType(std::u16string_view drive) const override;

 private:
  struct Mount {
    std::u16string mountPoint;
    unsigned type;
  };
  std::vector<Mount> ReadMounts() const;
  bool KernelSaysRemovable(const std::string& source) const;

  std::filesystem::path mountTable_;
  std::filesystem::path sysClassBlock_;
  FolderDrives foldersFirst_;
};

// Undoes the octal escapes (\040 for a space ...) of a mount table field.
std::string UnescapeMountField(const std::string& field);

}  // namespace kestrune::platform
