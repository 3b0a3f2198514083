#include "library/discovery.h"

#include <exception>

#include "base/text.h"
#include "base/utf.h"

namespace kestrune {

void ListRemovableDrives(const platform::Drives& drives, std::vector<std::u16string>& list) {
  const std::u16string buffer = drives.LogicalDriveStrings();
  std::u16string drive;
  for (char16_t unit : buffer) {
    if (unit != u'\0') {
      drive += unit;
      continue;
    }
    if (drive.empty()) continue;
    drive.pop_back();  // the root's separator
    // Only drive letters take upper case; a mount point's letters are part of its name.
    if (drive.size() == 2 && drive[1] == u':') drive = AsciiUpper(drive);
    if (drives.DriveType(drive) == platform::kDriveRemovable && drive != u"A:" && drive != u"B:") {
      list.push_back(drive);
    }
    drive.clear();
  }
}

std::optional<TrackLibrary> FindDevice(const platform::Drives& drives, std::string* failure) {
  std::u16string current;
  try {
    std::vector<std::u16string> candidates;
    ListRemovableDrives(drives, candidates);
    for (const std::u16string& drive : candidates) {
      current = drive;
      TrackLibrary library(drive);
      if (library.LoadDatabase()) return library;
    }
  } catch (const std::exception& error) {
    if (failure != nullptr) *failure = EncodeUtf8(current) + ": " + error.what();
  }
  return std::nullopt;
}

}  // namespace kestrune
