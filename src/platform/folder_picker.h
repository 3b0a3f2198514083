#pragma once

#include <memory>
#include <string>
#include <string_view>

namespace kestrune::platform {

// A top-level window of the platform (HWND, GtkWindow*), or none.
using NativeWindow = void*;

// The system's folder picker. Kept apart from the shell so that programs without a window (the
// command line) do not link a user interface toolkit.
class FolderPicker {
 public:
  virtual ~FolderPicker() = default;

  // Shows the picker over `owner` with `title` as its prompt and waits; the chosen folder's path,
  // or empty text when the user cancelled or the choice is no folder of the file system.
  virtual std::u16string BrowseForFolder(NativeWindow owner, std::u16string_view title) = 0;
};

std::unique_ptr<FolderPicker> MakeSystemFolderPicker();

}  // namespace kestrune::platform
