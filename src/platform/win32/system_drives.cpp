#include <windows.h>

#include <vector>

#include "platform/folder_drives.h"
#include "platform/system.h"

namespace kestrune::platform {
namespace {

std::wstring Wide(std::u16string_view text) { return std::wstring(text.begin(), text.end()); }

class WindowsDrives : public Drives {
 public:
  explicit WindowsDrives(FolderDrives foldersFirst) : foldersFirst_(std::move(foldersFirst)) {}

  std::u16string LogicalDriveStrings() const override {
    std::u16string list = foldersFirst_.LogicalDriveStrings();
    list.pop_back();  // the folders' list end; the system's list follows
    const DWORD needed = GetLogicalDriveStringsW(0, nullptr);
    if (needed == 0) return list + u'\0';
    std::vector<wchar_t> buffer(needed, L'\0');
    const DWORD written = GetLogicalDriveStringsW(needed, buffer.data());
    if (written == 0 || written > needed) return list + u'\0';
    list.append(buffer.begin(), buffer.begin() + static_cast<std::ptrdiff_t>(written));
    list += u'\0';
    return list;
  }

  unsigned DriveType(std::u16string_view drive) const override {
    const unsigned folderType = foldersFirst_.DriveType(drive);
    if (folderType != kDriveNoRootDir) return folderType;
    return GetDriveTypeW(Wide(drive).c_str());
  }

 private:
  FolderDrives foldersFirst_;
};

}  // namespace

std::unique_ptr<Drives> MakeSystemDrives(const std::vector<std::filesystem::path>& foldersFirst) {
  FolderDrives folders;
  for (const auto& folder : foldersFirst) folders.AddFolder(folder);
  return std::make_unique<WindowsDrives>(std::move(folders));
}

}  // namespace kestrune::platform
