#pragma once

#include <optional>
#include <string>
#include <string_view>

namespace kestrune::platform {

enum class SpecialFolder {
  kMusic,         // the user's music folder
  kProgramFiles,  // where programs are installed; Windows only
  kProfile,       // the user's home folder
};

// The parts of the desktop shell the export needs.
class Shell {
 public:
  virtual ~Shell() = default;

  // The folder's path; empty when the system has no such folder.
  virtual std::optional<std::u16string> SpecialFolderPath(SpecialFolder folder) const = 0;

  // The full path of the running program's own file.
  virtual std::u16string ProgramPath() const = 0;

  // Starts a command line and does not wait for it; whether it started is not told.
  virtual void Run(std::u16string_view commandLine) = 0;
};

}  // namespace kestrune::platform
