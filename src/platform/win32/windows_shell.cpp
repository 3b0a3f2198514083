#include <shlobj.h>
#include <windows.h>

#include <string>
#include <vector>

#include "platform/system.h"

namespace kestrune::platform {
namespace {

class WindowsShell : public Shell {
 public:
  std::optional<std::u16string> SpecialFolderPath(SpecialFolder folder) const override {
    int id = CSIDL_MYMUSIC;
    if (folder == SpecialFolder::kProgramFiles) id = CSIDL_PROGRAM_FILES;
    if (folder == SpecialFolder::kProfile) id = CSIDL_PROFILE;
    wchar_t path[MAX_PATH] = {};
    if (!SHGetSpecialFolderPathW(nullptr, path, id, TRUE)) return std::nullopt;
    return std::u16string(path, path + wcslen(path));
  }

  std::u16string ProgramPath() const override {
    wchar_t path[MAX_PATH] = {};
    const DWORD length = GetModuleFileNameW(nullptr, path, MAX_PATH);
    return std::u16string(path, path + length);
  }

  void Run(std::u16string_view commandLine) override {
    // WinExec takes the command line in the ANSI code page.
    const std::wstring wide(commandLine.begin(), commandLine.end());
    const int size = WideCharToMultiByte(CP_ACP, 0, wide.c_str(), -1, nullptr, 0, nullptr, nullptr);
    if (size <= 0) return;
    std::vector<char> narrow(static_cast<std::size_t>(size));
    WideCharToMultiByte(CP_ACP, 0, wide.c_str(), -1, narrow.data(), size, nullptr, nullptr);
    WinExec(narrow.data(), SW_SHOWNORMAL);
  }
};

}  // namespace

std::unique_ptr<Shell> MakeSystemShell() { return std::make_unique<WindowsShell>(); }

}  // namespace kestrune::platform
