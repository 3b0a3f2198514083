#include <spawn.h>
#include <sys/wait.h>
#include <unistd.h>

#include <cstdlib>
#include <fstream>
#include <string>

#include "base/paths.h"
#include "base/utf.h"
#include "platform/linux/key_file_store.h"
#include "platform/system.h"

extern char** environ;

namespace kestrune::platform {
namespace {

std::string HomeFolder() {
  const char* home = std::getenv("HOME");
  return home != nullptr ? home : "";
}

// XDG_MUSIC_DIR of user-dirs.dirs: a quoted path, "$HOME/..." or absolute.
std::optional<std::string> UserDirsMusicFolder() {
  std::ifstream in(UserConfigFolder() / "user-dirs.dirs");
  const std::string key = "XDG_MUSIC_DIR=\"";
  std::string line;
  while (std::getline(in, line)) {
    if (line.compare(0, key.size(), key) != 0 || line.size() < key.size() + 1 || line.back() != '"')
      continue;
    std::string value = line.substr(key.size(), line.size() - key.size() - 1);
    if (value.compare(0, 5, "$HOME") == 0) value = HomeFolder() + value.substr(5);
    if (!value.empty() && value.front() == '/') return value;
  }
  return std::nullopt;
}

class DesktopShell : public Shell {
 public:
  std::optional<std::u16string> SpecialFolderPath(SpecialFolder folder) const override {
    const std::string home = HomeFolder();
    switch (folder) {
      case SpecialFolder::kMusic:
        if (auto music = UserDirsMusicFolder()) return TextFromPath(*music);
        // The folder user-dirs proposes when nothing is configured.
        if (!home.empty()) return TextFromPath(home + "/Music");
        return std::nullopt;
      case SpecialFolder::kProfile:
        if (!home.empty()) return TextFromPath(home);
        return std::nullopt;
      case SpecialFolder::kProgramFiles:
        return std::nullopt;
    }
    return std::nullopt;
  }

  std::u16string ProgramPath() const override {
    std::error_code error;
    return TextFromPath(std::filesystem::read_symlink("/proc/self/exe", error));
  }

  void Run(std::u16string_view commandLine) override {
    // The shell puts the command in the background and ends at once, so nothing is left to reap.
    const std::string script = EncodeUtf8(commandLine) + " >/dev/null 2>&1 &";
    char shell[] = "/bin/sh", flag[] = "-c";
    std::string scriptCopy = script;
    char* arguments[] = {shell, flag, scriptCopy.data(), nullptr};
    pid_t child = 0;
    if (::posix_spawn(&child, "/bin/sh", nullptr, nullptr, arguments, environ) == 0) {
      int status = 0;
      ::waitpid(child, &status, 0);
    }
  }
};

}  // namespace

std::unique_ptr<Shell> MakeSystemShell() { return std::make_unique<DesktopShell>(); }

}  // namespace kestrune::platform
