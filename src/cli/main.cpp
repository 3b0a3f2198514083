#include <csignal>
#include <iostream>
#include <string>
#include <vector>

#include "base/paths.h"
#include "cli/commands.h"
#include "cli/export_command.h"
#include "cli/options.h"
#include "platform/console.h"
#include "platform/folder_drives.h"
#include "platform/system.h"

#ifdef _WIN32
#include <fcntl.h>
#include <io.h>
#endif

namespace {

kestrune::StopRequest stopRequest;

// Ctrl+C stops the export after the file being copied, as the Terminate button does; a second
// one ends the program at once.
extern "C" void OnInterrupt(int) {
  stopRequest.Raise();
  std::signal(SIGINT, SIG_DFL);
}

int RunExport(const kestrune::cli::Options& options, const kestrune::platform::Drives& drives) {
  using namespace kestrune;
  const auto settings = platform::MakeSystemSettingsStore();
  const auto shell = platform::MakeSystemShell();
  const auto files = platform::MakeSystemFiles();
  cli::ExportEnvironment environment{*settings,
                                     *shell,
                                     *files,
                                     stopRequest,
                                     platform::StandardOutputIsTerminal(),
                                     platform::TerminalColumns()};
  std::signal(SIGINT, OnInterrupt);
  return cli::RunExportCommand(options, drives, environment, std::cout, std::cerr);
}

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
    case cli::Command::kList:
    case cli::Command::kExport: {
      const bool list = options->command == cli::Command::kList;
      if (!options->device) {
        const auto drives = platform::MakeSystemDrives();
        return list ? cli::RunList(*options, *drives, std::cout, std::cerr)
                    : RunExport(*options, *drives);
      }
      // A device folder named on the command line is the only place looked at.
      platform::FolderDrives folder;
      folder.AddFolder(PathFromText(*options->device));
      return list ? cli::RunList(*options, folder, std::cout, std::cerr)
                  : RunExport(*options, folder);
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
