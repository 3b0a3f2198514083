#pragma once

#include <string>
#include <string_view>
#include <vector>

#include "export/progress.h"
#include "library/track.h"

namespace kestrune {

enum class ExportOption { kOrganized, kAddToItunes };

// Everything the export job shows and reads, in the order it does so. The window carries each
// call to its UI thread and waits for it (the engine is not thread safe); the command line
// answers from its arguments and writes to the terminal. Calls come from the job's worker thread.
class ExportDisplay {
 public:
  virtual ~ExportDisplay() = default;

  // The main form: disabled while a job runs, so nothing else can start or change.
  virtual void EnableForm(bool enabled) = 0;

  // The ticked tracks in the order the table shows them, and the output folder as typed.
  virtual std::vector<Track> CollectTickedTracks() = 0;
  virtual std::u16string OutputFolderText() = 0;

  // An option's tick at the moment of asking.
  virtual bool IsTicked(ExportOption option) = 0;

  // A message with an OK button; returns once it has been dismissed.
  virtual void ShowMessage(std::u16string_view text, std::u16string_view title) = 0;

  virtual void ShowProgressPanel() = 0;
  virtual void ShowProgress(const ProgressView& progress) = 0;

  // The end of a job: Terminate hidden, Finish shown; the form stays disabled until Finish.
  virtual void ShowFinish() = 0;
};

}  // namespace kestrune
