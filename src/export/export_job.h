#pragma once

#include <atomic>
#include <cstdint>
#include <string>
#include <string_view>
#include <thread>
#include <vector>

#include "export/export_display.h"
#include "export/library_sync.h"
#include "library/track_library.h"
#include "platform/files.h"

namespace kestrune {

inline constexpr std::u16string_view kExportingTitle = u"Exporting music ";
inline constexpr std::u16string_view kExportedTitle = u"Successfully exported ";
inline constexpr std::u16string_view kFinishedTitle = u"Finished ";
inline constexpr std::u16string_view kDoneItem = u"Done!";

inline constexpr std::u16string_view kNoDeviceText =
    u"Make sure you have connected your iPod to your computer!";
inline constexpr std::u16string_view kNoDeviceTitle = u"No iPod Device Found";
inline constexpr std::u16string_view kNothingTickedText =
    u"No music/video has been selected to export!";
inline constexpr std::u16string_view kNothingTickedTitle = u"No iPod song selected";
inline constexpr std::u16string_view kNoFolderText = u"Please specify the output folder!";
inline constexpr std::u16string_view kNoFolderTitle = u"No output folder";

// The Terminate button's request: raised by an atomic increment from any thread (or a signal
// handler), taken by the copy loop after the file it is copying. Any count counts.
class StopRequest {
 public:
  void Raise() { count_.fetch_add(1); }
  void Clear() { count_.store(0); }
  // True, and cleared, when a stop was asked for.
  bool Take() { return count_.exchange(0) != 0; }

 private:
  std::atomic<std::uint32_t> count_{0};
};

enum class CopyOutcome { kCopied, kAlreadyPresent, kFailed };

struct TrackResult {
  std::uint32_t trackId = 0;
  std::u16string title;
  std::u16string target;
  CopyOutcome outcome = CopyOutcome::kFailed;
  std::string reason;  // why a copy failed
};

// What a job did, for callers that report it (the window shows nothing of it).
struct ExportReport {
  bool started = false;  // the checks passed and copying began
  std::uint32_t total = 0;
  std::vector<TrackResult> results;  // the tracks handled, in order
  CopiedFiles copiedFiles;
};

struct ExportContext {
  ExportDisplay& display;
  platform::Files& files;
  StopRequest& stop;
  LibrarySyncContext sync;
};

// The three checks, in order, each with its message; false at the first that fails.
bool ValidateExport(bool libraryLoaded, std::size_t count, std::u16string_view outputFolder,
                    ExportDisplay& display);

// Copies one track to its target unless an earlier copy is there, and records the copy.
TrackResult CopyOneTrack(const Track& track, const std::u16string& outputFolder,
                         ExportContext& context, CopiedFiles& copiedFiles);

// Copies the tracks in order with progress before each, stopping between two files on request.
// Gives how many tracks were handled, the stopped one included.
std::uint32_t CopyAll(const std::vector<Track>& tracks, const std::u16string& outputFolder,
                      ExportContext& context, ExportReport& report);

// Shows the panel, copies, hands the copies to the media library when asked to, and ends in the
// Finished state, whatever was thrown on the way.
void ExportTracks(const std::vector<Track>& tracks, const std::u16string& outputFolder,
                  const std::vector<Playlist>& playlists, ExportContext& context,
                  ExportReport& report);

// The whole job on the calling thread: a new job starts with the stop request cleared; the
// form is disabled, the ticked tracks and the folder are read and checked, then exported.
// `library` is the loaded device, or null when none is loaded. `report` is filled as the job
// goes, so that the media library's side can look up what was copied while it works.
void RunExport(const TrackLibrary* library, ExportContext& context, ExportReport& report);

// RunExport on a thread of its own. The window detaches the thread; the command line joins it.
// The library and the report must outlive the thread.
std::thread StartExport(const TrackLibrary* library, ExportContext context, ExportReport& report);

}  // namespace kestrune
