#include "platform/folder_drives.h"

#include "base/paths.h"
#include "base/text.h"

namespace kestrune::platform {

FolderDrives::FolderDrives(std::vector<Entry> entries) : entries_(std::move(entries)) {}

void FolderDrives::Add(std::u16string root, unsigned type) {
  entries_.push_back({std::move(root), type});
}

void FolderDrives::AddFolder(const std::filesystem::path& folder, unsigned type) {
  std::u16string root = TextFromPath(folder);
  // "dev/" and "dev" are one folder; the drive list adds its own separator.
  while (root.size() > 1 && (root.back() == u'/' || root.back() == kPathSeparator)) root.pop_back();
  Add(std::move(root), type);
}

std::u16string FolderDrives::LogicalDriveStrings() const {
  std::u16string list;
  for (const Entry& entry : entries_) {
    list += entry.root;
    list += kPathSeparator;
    list += u'\0';
  }
  list += u'\0';
  return list;
}

unsigned FolderDrives::DriveType(std::u16string_view drive) const {
  for (const Entry& entry : entries_) {
    if (entry.root == drive) return entry.type;
    // Drive letters are compared without regard to case, as the system compares them.
    const bool driveLetter = drive.size() == 2 && drive[1] == u':';
    if (driveLetter && EqualsIgnoringAsciiCase(entry.root, drive)) return entry.type;
  }
  return kDriveNoRootDir;
}

}  // namespace kestrune::platform
