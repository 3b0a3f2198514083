// Shows the system's folder picker and prints what it gave, for the scripts that drive it.
#include <cstdio>
#include <string>

#include "base/utf.h"
#include "platform/folder_picker.h"

int main(int argc, char** argv) {
  const std::u16string title =
      kestrune::DecodeUtf8(argc > 1 ? argv[1] : "Select a target folder below:");
  const std::u16string chosen =
      kestrune::platform::MakeSystemFolderPicker()->BrowseForFolder(nullptr, title);
  std::printf("chosen:%s\n", kestrune::EncodeUtf8(chosen).c_str());
  return 0;
}
