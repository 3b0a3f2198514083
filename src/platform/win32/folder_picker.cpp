#include "platform/folder_picker.h"

#include <objbase.h>
#include <shlobj.h>
#include <windows.h>

namespace kestrune::platform {
namespace {

// BIF_RETURNONLYFSDIRS | BIF_NEWDIALOGSTYLE: folders of the file system, in the resizable picker.
constexpr UINT kBrowseFlags = 0x41;

class ShellFolderPicker : public FolderPicker {
 public:
  std::u16string BrowseForFolder(NativeWindow owner, std::u16string_view title) override {
    // The picker of the new style needs COM on the calling thread.
    const HRESULT com = CoInitializeEx(nullptr, COINIT_APARTMENTTHREADED);
    std::u16string chosen = Browse(static_cast<HWND>(owner), title);
    if (SUCCEEDED(com)) CoUninitialize();
    return chosen;
  }

 private:
  static std::u16string Browse(HWND owner, std::u16string_view title) {
    IMalloc* allocator = nullptr;
    if (FAILED(SHGetMalloc(&allocator)) || allocator == nullptr) return {};
    const std::wstring prompt(title.begin(), title.end());
    wchar_t displayName[MAX_PATH] = {};
    BROWSEINFOW request = {};
    request.hwndOwner = owner;
    request.pszDisplayName = displayName;
    request.lpszTitle = prompt.c_str();
    request.ulFlags = kBrowseFlags;
    std::u16string chosen;
    if (PIDLIST_ABSOLUTE items = SHBrowseForFolderW(&request)) {
      wchar_t path[MAX_PATH] = {};
      if (SHGetPathFromIDListW(items, path) && path[0] != L'\0')
        chosen.assign(path, path + wcslen(path));
      allocator->Free(items);
    }
    allocator->Release();
    return chosen;
  }
};

}  // namespace

std::unique_ptr<FolderPicker> MakeSystemFolderPicker() {
  return std::make_unique<ShellFolderPicker>();
}

}  // namespace kestrune::platform
