#pragma once

#include <filesystem>
#include <string>
#include <string_view>
#include <vector>

#include "platform/drives.h"

namespace kestrune::platform {

// Chosen folders presented as drives, each with a type of its own: the device folder given on
// a command line, and the drive list of tests.
class FolderDrives : public Drives {
 public:
  struct Entry {
    std::u16string root;  // as listed: a drive string or folder, without a trailing separator
    unsigned type = kDriveRemovable;
  };

  FolderDrives() = default;
  explicit FolderDrives(std::vector<Entry> entries);

  void Add(std::u16string root, unsigned type = kDriveRemovable);
  // A folder of this machine, listed without trailing separators (the root folder keeps its own).
  void AddFolder(const std::filesystem::path& folder, unsigned type = kDriveRemovable);

  std::u16string LogicalDriveStrings() const override;
  unsigned DriveType(std::u16string_view drive) const override;

  const std::vector<Entry>& entries() const { return entries_; }

 private:
  std::vector<Entry> entries_;
};

}  // namespace kestrune::platform
