#pragma once

#include <ostream>

#include "cli/options.h"
#include "export/export_job.h"
#include "platform/drives.h"
#include "platform/files.h"
#include "platform/settings_store.h"
#include "platform/shell.h"

namespace kestrune::cli {

// Exit status when some chosen track was not exported (failed, or the export was stopped or
// refused).
inline constexpr int kExitIncomplete = 1;

// What `export` uses of the system besides the drives.
struct ExportEnvironment {
  platform::SettingsStore& settings;
  platform::Shell& shell;
  platform::Files& files;
  StopRequest& stop;
  bool terminal = false;  // progress redraws one line
  int columns = 80;
};

// Exports the chosen tracks of the device the search finds with the window's export job, then
// prints what was copied, already present and failed (with why). 0 when every chosen track was
// copied or already present.
int RunExportCommand(const Options& options, const platform::Drives& drives,
                     ExportEnvironment& environment, std::ostream& out, std::ostream& err);

}  // namespace kestrune::cli
