#pragma once

#include <functional>
#include <string>
#include <vector>

#include "base/utf.h"
#include "export/export_display.h"

namespace kestrune::test {

// Answers the job from its fields and writes down every call, texts in UTF-8:
// "form on|off", "message TITLE|TEXT", "panel", "progress TITLELINE|WIDTH|ITEM", "finish".
class RecordingDisplay : public ExportDisplay {
 public:
  void EnableForm(bool enabled) override { calls.push_back(enabled ? "form on" : "form off"); }
  std::vector<Track> CollectTickedTracks() override { return ticked; }
  std::u16string OutputFolderText() override { return outputFolder; }
  bool IsTicked(ExportOption option) override {
    return option == ExportOption::kOrganized ? organized : addToItunes;
  }
  void ShowMessage(std::u16string_view text, std::u16string_view title) override {
    calls.push_back("message " + EncodeUtf8(title) + "|" + EncodeUtf8(text));
  }
  void ShowProgressPanel() override { calls.push_back("panel"); }
  void ShowProgress(const ProgressView& progress) override {
    calls.push_back("progress " + EncodeUtf8(progress.titleLine) + "|" +
                    EncodeUtf8(progress.barWidth) + "|" + EncodeUtf8(progress.item));
    if (onProgress) onProgress(progress);
  }
  void ShowFinish() override { calls.push_back("finish"); }

  // The calls that start with `prefix`.
  std::vector<std::string> CallsStartingWith(const std::string& prefix) const {
    std::vector<std::string> found;
    for (const std::string& call : calls) {
      if (call.rfind(prefix, 0) == 0) found.push_back(call);
    }
    return found;
  }

  std::vector<Track> ticked;
  std::u16string outputFolder;
  bool organized = true;
  bool addToItunes = false;
  std::function<void(const ProgressView&)> onProgress;
  std::vector<std::string> calls;
};

}  // namespace kestrune::test
