#pragma once

#include <map>
#include <string>
#include <vector>

#include "platform/clock.h"
#include "platform/shell.h"

namespace kestrune::platform {

// A shell that answers from its fields and records every command it is asked to run.
class FakeShell : public Shell {
 public:
  std::optional<std::u16string> SpecialFolderPath(SpecialFolder folder) const override {
    const auto found = folders.find(folder);
    if (found == folders.end()) return std::nullopt;
    return found->second;
  }
  std::u16string ProgramPath() const override { return programPath; }
  void Run(std::u16string_view commandLine) override { runs.emplace_back(commandLine); }

  std::map<SpecialFolder, std::u16string> folders;
  std::u16string programPath = u"C:\\Kestrune\\Kestrune.exe";
  std::vector<std::u16string> runs;
};

// Time that passes only when someone pauses.
class FakeClock : public Clock {
 public:
  std::chrono::steady_clock::time_point Now() const override { return now_; }
  void Pause(std::chrono::milliseconds duration) override {
    now_ += duration;
    ++pauses;
  }
  int pauses = 0;

 private:
  std::chrono::steady_clock::time_point now_{};
};

}  // namespace kestrune::platform
