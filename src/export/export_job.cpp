#include "export/export_job.h"

#include <exception>

#include "base/paths.h"
#include "export/naming.h"
#include "library/device_files.h"

namespace kestrune {
namespace {

void ShowProgress(ExportDisplay& display, std::u16string_view title, std::uint32_t done,
                  std::uint32_t total, std::u16string_view item) {
  display.ShowProgress(MakeProgress(title, done, total, item));
}

}  // namespace

bool ValidateExport(bool libraryLoaded, std::size_t count, std::u16string_view outputFolder,
                    ExportDisplay& display) {
  if (!libraryLoaded) {
    display.ShowMessage(kNoDeviceText, kNoDeviceTitle);
    return false;
  }
  if (count == 0) {
    display.ShowMessage(kNothingTickedText, kNothingTickedTitle);
    return false;
  }
  if (outputFolder.empty()) {
    display.ShowMessage(kNoFolderText, kNoFolderTitle);
    return false;
  }
  return true;
}

TrackResult CopyOneTrack(const Track& track, const std::u16string& outputFolder,
                         ExportContext& context, CopiedFiles& copiedFiles) {
  TrackResult result{track.trackId, track.title, {}, CopyOutcome::kFailed, {}};
  try {
    const std::u16string extension = ExtensionOf(track.devicePath);
    bool present = false;
    const bool organized = context.display.IsTicked(ExportOption::kOrganized);
    result.target =
        TargetPathFor(track, extension, outputFolder, organized, context.files, present);
    const std::filesystem::path target = PathFromText(result.target);
    if (present) {
      result.outcome = CopyOutcome::kAlreadyPresent;
    } else if (const std::optional<std::filesystem::path> source = LocateTrackFile(track);
               !source) {
      result.reason = "the file is missing on the device";
    } else if (const std::error_code error = context.files.CopyFileReplacing(*source, target)) {
      result.reason = error.message();
    } else {
      result.outcome = CopyOutcome::kCopied;
    }
    if (result.outcome != CopyOutcome::kFailed) {
      context.files.SetNormalAttributes(target);
      copiedFiles[track.trackId] = result.target;
    }
  } catch (const std::exception& error) {
    result.outcome = CopyOutcome::kFailed;
    result.reason = error.what();
  }
  return result;
}

std::uint32_t CopyAll(const std::vector<Track>& tracks, const std::u16string& outputFolder,
                      ExportContext& context, ExportReport& report) {
  const auto total = static_cast<std::uint32_t>(tracks.size());
  std::uint32_t done = 0;
  for (const Track& track : tracks) {
    ++done;
    ShowProgress(context.display, kExportingTitle, done, total, track.title);
    report.results.push_back(CopyOneTrack(track, outputFolder, context, report.copiedFiles));
    if (context.stop.Take()) break;
  }
  ShowProgress(context.display, kExportedTitle, done, total, u"");
  return done;
}

void ExportTracks(const std::vector<Track>& tracks, const std::u16string& outputFolder,
                  const std::vector<Playlist>& playlists, ExportContext& context,
                  ExportReport& report) {
  ExportDisplay& display = context.display;
  display.EnableForm(false);
  display.ShowProgressPanel();
  report.started = true;
  report.total = static_cast<std::uint32_t>(tracks.size());
  report.copiedFiles.clear();
  try {
    CopyAll(tracks, outputFolder, context, report);
    if (display.IsTicked(ExportOption::kAddToItunes) && !report.copiedFiles.empty()) {
      SyncToItunes(report.copiedFiles, playlists, display, context.sync);
    }
    ShowProgress(display, kFinishedTitle, report.total, report.total, kDoneItem);
  } catch (const std::exception&) {
    // Whatever failed, the panel must reach Finish so that the user can close it.
  }
  display.ShowFinish();
}

void RunExport(const TrackLibrary* library, ExportContext& context, ExportReport& report) {
  report = ExportReport{};
  context.stop.Clear();
  try {
    ExportDisplay& display = context.display;
    display.EnableForm(false);
    const std::vector<Track> tracks = display.CollectTickedTracks();
    const std::u16string outputFolder = display.OutputFolderText();
    if (!ValidateExport(library != nullptr, tracks.size(), outputFolder, display)) {
      display.EnableForm(true);
      return;
    }
    ExportTracks(tracks, outputFolder, library->playlists(), context, report);
  } catch (const std::exception&) {
    // Nothing may escape the worker thread.
  }
}

std::thread StartExport(const TrackLibrary* library, ExportContext context, ExportReport& report) {
  return std::thread(
      [library, context, &report]() mutable { RunExport(library, context, report); });
}

}  // namespace kestrune
