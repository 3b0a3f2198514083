#include <shlobj.h>
#include <windows.h>

#include <atomic>
#include <string>

#include "platform/system.h"

namespace kestrune::platform {
namespace {

std::error_code LastError() { return {static_cast<int>(GetLastError()), std::system_category()}; }

std::filesystem::path TemporaryNameBeside(const std::filesystem::path& target) {
  static std::atomic<unsigned> counter{0};
  // Short, so that a target near the path length limit still has a temporary name.
  return target.parent_path() / (L"~kestrune-" + std::to_wstring(GetCurrentProcessId()) + L"-" +
                                 std::to_wstring(counter++) + L".tmp");
}

void Remove(const std::filesystem::path& path) {
  // CopyFileW carries the source's read-only flag over, which would refuse the deletion.
  SetFileAttributesW(path.c_str(), FILE_ATTRIBUTE_NORMAL);
  DeleteFileW(path.c_str());
}

class WindowsFiles : public Files {
 public:
  bool FileExists(const std::filesystem::path& path) const override {
    return GetFileAttributesW(path.c_str()) != INVALID_FILE_ATTRIBUTES;
  }

  std::uint64_t FileSizeOf(const std::filesystem::path& path) const override {
    WIN32_FILE_ATTRIBUTE_DATA data;
    if (!GetFileAttributesExW(path.c_str(), GetFileExInfoStandard, &data)) return 0;
    if ((data.dwFileAttributes & FILE_ATTRIBUTE_DIRECTORY) != 0) return 0;
    return (std::uint64_t{data.nFileSizeHigh} << 32) | data.nFileSizeLow;
  }

  bool CreateFolderPath(const std::filesystem::path& path) override {
    // The shell's function wants a full path.
    std::error_code error;
    const std::filesystem::path full = std::filesystem::absolute(path, error);
    const int result = SHCreateDirectoryExW(nullptr, (error ? path : full).c_str(), nullptr);
    return result == ERROR_SUCCESS || result == ERROR_ALREADY_EXISTS || result == ERROR_FILE_EXISTS;
  }

  std::error_code CopyFileReplacing(const std::filesystem::path& source,
                                    const std::filesystem::path& target) override {
    const std::filesystem::path temporary = TemporaryNameBeside(target);
    if (!CopyFileW(source.c_str(), temporary.c_str(), TRUE)) {
      const std::error_code error = LastError();
      Remove(temporary);
      return error;
    }
    if (!MoveFileExW(temporary.c_str(), target.c_str(), MOVEFILE_REPLACE_EXISTING)) {
      const std::error_code error = LastError();
      Remove(temporary);
      return error;
    }
    return {};
  }

  void SetNormalAttributes(const std::filesystem::path& path) override {
    SetFileAttributesW(path.c_str(), FILE_ATTRIBUTE_NORMAL);
  }
};

}  // namespace

std::unique_ptr<Files> MakeSystemFiles() { return std::make_unique<WindowsFiles>(); }

}  // namespace kestrune::platform
