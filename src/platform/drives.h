#pragma once

#include <string>
#include <string_view>

namespace kestrune::platform {

// Drive types as GetDriveTypeW reports them; only removable drives hold a device.
enum DriveTypeCode : unsigned {
  kDriveUnknown = 0,
  kDriveNoRootDir = 1,
  kDriveRemovable = 2,
  kDriveFixed = 3,
  kDriveRemote = 4,
  kDriveCdRom = 5,
  kDriveRamDisk = 6,
};

class Drives {
 public:
  virtual ~Drives() = default;

  // Every drive's root (a drive letter, a colon and a backslash on Windows; a mount point and a
  // separator elsewhere), each ended by a zero unit, the list ended by one more zero unit.
  virtual std::u16string LogicalDriveStrings() const = 0;

  // The type of a drive given without its trailing separator ("E:", "/media/user/IPOD").
  virtual unsigned DriveType(std::u16string_view drive) const = 0;
};

}  // namespace kestrune::platform
