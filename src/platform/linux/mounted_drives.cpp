#include "platform/linux/mounted_drives.h"

#include <fstream>
#include <sstream>

#include "base/paths.h"

namespace kestrune::platform {
namespace {

bool StartsWith(const std::string& text, const std::string& prefix) {
  return text.compare(0, prefix.size(), prefix) == 0;
}

bool UnderDesktopMediaFolder(const std::string& mountPoint) {
  return StartsWith(mountPoint, "/media/") || StartsWith(mountPoint, "/run/media/");
}

}  // namespace

std::string UnescapeMountField(const std::string& field) {
  std::string out;
  for (std::size_t i = 0; i < field.size(); ++i) {
    const bool octal = field[i] == '\\' && i + 3 < field.size() && field[i + 1] >= '0' &&
                       field[i + 1] <= '3' && field[i + 2] >= '0' && field[i + 2] <= '7' &&
                       field[i + 3] >= '0' && field[i + 3] <= '7';
    if (octal) {
      out.push_back(static_cast<char>((field[i + 1] - '0') * 64 + (field[i + 2] - '0') * 8 +
                                      (field[i + 3] - '0')));
      i += 3;
    } else {
      out.push_back(field[i]);
    }
  }
  return out;
}

MountedDrives::MountedDrives(std::filesystem::path mountTable, std::filesystem::path sysClassBlock,
                             FolderDrives foldersFirst)
    : mountTable_(std::move(mountTable)),
      sysClassBlock_(std::move(sysClassBlock)),
      foldersFirst_(std::move(foldersFirst)) {}

bool MountedDrives::KernelSaysRemovable(const std::string& source) const {
  if (!StartsWith(source, "/dev/")) return false;
  const std::string name = std::filesystem::path(source).filename().string();
  std::error_code error;
  std::filesystem::path device = std::filesystem::canonical(sysClassBlock_ / name, error);
  if (error) return false;
  // A partition carries no flag of its own; its disk is the folder above it.
  if (std::filesystem::exists(device / "partition", error)) device = device.parent_path();
  std::ifstream flag(device / "removable");
  char value = '0';
  return flag.get(value) && value == '1';
}

std::vector<MountedDrives::Mount> MountedDrives::ReadMounts() const {
  std::vector<Mount> mounts;
  std::ifstream table(mountTable_);
  std::string line;
  while (std::getline(table, line)) {
    std::istringstream fields(line);
    std::string source, mountPoint;
    if (!(fields >> source >> mountPoint)) continue;
    mountPoint = UnescapeMountField(mountPoint);
    source = UnescapeMountField(source);
    unsigned type;
    if (UnderDesktopMediaFolder(mountPoint) || KernelSaysRemovable(source)) {
      type = kDriveRemovable;
    } else if (StartsWith(source, "/dev/")) {
      type = kDriveFixed;
    } else {
      continue;
    }
    mounts.push_back({TextFromPath(mountPoint), type});
  }
  return mounts;
}

std::u16string MountedDrives::LogicalDriveStrings() const {
  std::u16string list = foldersFirst_.LogicalDriveStrings();
  list.pop_back();  // the folders' list end; the mounts follow
  for (const Mount& mount : ReadMounts()) {
    list += mount.mountPoint;
    list += u'/';
    list += u'\0';
  }
  list += u'\0';
  return list;
}

unsigned MountedDrives::DriveType(std::u16string_view drive) const {
  const unsigned folderType = foldersFirst_.DriveType(drive);
  if (folderType != kDriveNoRootDir) return folderType;
  for (const Mount& mount : ReadMounts()) {
    if (mount.mountPoint == drive) return mount.type;
  }
  return kDriveNoRootDir;
}

}  // namespace kestrune::platform
