#pragma once

#include <ostream>
#include <string>
#include <vector>

#include "export/export_display.h"

namespace kestrune::cli {

// The export job's display on a terminal: the chosen tracks and options answer its questions,
// progress is one line that redraws itself with a bar (or plain lines when the output is no
// terminal), and messages go to the error stream.
class TerminalDisplay : public ExportDisplay {
 public:
  struct Choices {
    std::vector<Track> tracks;
    std::u16string outputFolder;
    bool organized = true;
    bool rebuildPlaylists = false;
  };

  TerminalDisplay(Choices choices, bool terminal, int columns, std::ostream& out,
                  std::ostream& err);

  void EnableForm(bool) override {}
  std::vector<Track> CollectTickedTracks() override { return choices_.tracks; }
  std::u16string OutputFolderText() override { return choices_.outputFolder; }
  bool IsTicked(ExportOption option) override;
  void ShowMessage(std::u16string_view text, std::u16string_view title) override;
  void ShowProgressPanel() override {}
  void ShowProgress(const ProgressView& progress) override;
  void ShowFinish() override;

 private:
  Choices choices_;
  bool terminal_;
  std::size_t columns_;
  std::ostream& out_;
  std::ostream& err_;
  bool lineOpen_ = false;
};

}  // namespace kestrune::cli
