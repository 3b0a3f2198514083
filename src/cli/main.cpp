#include <iostream>
#include <string>
#include <vector>

#include "base/paths.h"
#include "cli/commands.h"
#include "cli/options.h"
#include "platform/folder_drives.h"
#include "platform/system.h"

#ifdef _WIN32
#include <fcntl.h>
#include <io.h>
#endif

namespace {

int Run(const std::vector<std::u16string>& arguments) {
  using namespace kestrune;
  std::string error;
  const std::optional<cli::Options> options = cli::ParseOptions(arguments, error);
  if (!options) {
    std::cerr << "kestrune-cli: " << error << '\n' << cli::kUsage;
    return cli::kExitUsage;
  }
  switch (options->command) {
    case cli::Command::kHelp:
      std::cout << cli::kUsage;
      return cli::kExitOk;
    case cli::Command::kDevices: {
      std::vector<std::filesystem::path> first;
      if (options->device) first.push_back(PathFromText(*options->device));
      return cli::RunDevices(*platform::MakeSystemDrives(first), std::cout, std::cerr);
    }
    case cli::Command::kList: {
      if (!options->device)
        return cli::RunList(*options, *platform::MakeSystemDrives(), std::cout, std::cerr);
      // A device folder named on the command line is the only place looked at.
      platform::FolderDrives folder;
      folder.AddFolder(PathFromText(*options->device));
      return cli::RunList(*options, folder, std::cout, std::cerr);
    }
  }
  return cli::kExitUsage;
}

}  // namespace

#ifdef _WIN32
int wmain(int argc, wchar_t** argv) {
  // Texts go out as UTF-8 bytes, unchanged by the console's code page.
  _setmode(_fileno(stdout), _O_BINARY);
  std::vector<std::u16string> arguments;
  for (int i = 1; i < argc; ++i) arguments.emplace_back(argv[i], argv[i] + std::wcslen(argv[i]));
  return Run(arguments);
}
#else
int main(int argc, char** argv) {
  std::vector<std::u16string> arguments;
  for (int i = 1; i < argc; ++i) arguments.push_back(kestrune::TextFromPath(argv[i]));
  return Run(arguments);
}
#endif
