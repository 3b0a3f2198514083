#include "cli/export_command.h"

#include "base/paths.h"
#include "base/text.h"
#include "base/utf.h"
#include "cli/commands.h"
#include "cli/json_writer.h"
#include "cli/terminal_display.h"
#include "export/settings.h"
#include "library/discovery.h"
#include "platform/clock.h"
#include "platform/folder_library.h"
#include "view/track_search.h"

namespace kestrune::cli {
namespace {

// The chosen tracks in the order the window would list them: ascending id for the whole device,
// a playlist or a search, the given order for ids. Empty with `error` set on a mistake.
std::vector<Track> ChooseTracks(const Options& options, const TrackLibrary& library,
                                std::string& error) {
  std::vector<Track> chosen;
  const auto& tracks = library.tracks();
  if (options.search) return SearchTracks(tracks, *options.search);
  if (options.playlist && *options.playlist >= 0) {
    const auto index = static_cast<std::size_t>(*options.playlist);
    if (index >= library.playlists().size()) {
      error = "the device has " + std::to_string(library.playlists().size()) +
              " playlists, numbered from 0; there is no playlist " + std::to_string(index);
      return {};
    }
    for (const auto& [id, sameId] : library.playlists()[index].trackIds)
      chosen.push_back(tracks.at(id));
    return chosen;
  }
  if (!options.ids.empty()) {
    for (std::uint32_t id : options.ids) {
      const auto found = tracks.find(id);
      if (found == tracks.end()) {
        error = "the device has no track " + std::to_string(id);
        return {};
      }
      // Each track once, as a table never lists one twice.
      const bool seen = std::any_of(chosen.begin(), chosen.end(),
                                    [id](const Track& t) { return t.trackId == id; });
      if (!seen) chosen.push_back(found->second);
    }
    return chosen;
  }
  for (const auto& [id, track] : tracks) chosen.push_back(track);
  return chosen;
}

// Playlist lines for the folder library: the copy's track, found through what the job copied.
platform::MediaInfoLookup DescribeCopies(const TrackLibrary& library, const ExportReport& report) {
  return [&library, &report](std::u16string_view path) -> std::optional<platform::MediaInfo> {
    for (const auto& [id, copy] : report.copiedFiles) {
      if (copy != path) continue;
      const Track& track = library.tracks().at(id);
      return platform::MediaInfo{track.artist, track.title, track.lengthMs};
    }
    return std::nullopt;
  };
}

int PrintSummary(const ExportReport& report, const std::u16string& outputFolder, bool playlists,
                 std::ostream& out) {
  std::size_t copied = 0, present = 0, failed = 0;
  for (const TrackResult& result : report.results) {
    if (result.outcome == CopyOutcome::kCopied) ++copied;
    if (result.outcome == CopyOutcome::kAlreadyPresent) ++present;
    if (result.outcome == CopyOutcome::kFailed) ++failed;
  }
  out << "exported to " << EncodeUtf8(outputFolder) << '\n';
  out << "copied " << copied << ", already present " << present << ", failed " << failed << '\n';
  for (const TrackResult& result : report.results) {
    if (result.outcome == CopyOutcome::kFailed) {
      out << "failed: " << result.trackId << ' ' << JsonString(result.title) << ": "
          << result.reason << '\n';
    }
  }
  if (report.results.size() < report.total) {
    out << "stopped after " << report.results.size() << " of " << report.total << " tracks\n";
  }
  if (playlists)
    out << "playlists in " << EncodeUtf8(outputFolder + kPathSeparator + u"Playlists") << '\n';
  const bool complete = failed == 0 && report.results.size() == report.total;
  return complete ? kExitOk : kExitIncomplete;
}

}  // namespace

int RunExportCommand(const Options& options, const platform::Drives& drives,
                     ExportEnvironment& environment, std::ostream& out, std::ostream& err) {
  std::string failure;
  const std::optional<TrackLibrary> library = FindDevice(drives, &failure);
  TerminalDisplay::Choices choices;
  if (library) {
    std::string error;
    choices.tracks = ChooseTracks(options, *library, error);
    if (!error.empty()) {
      err << "kestrune-cli: " << error << '\n';
      return kExitUsage;
    }
  }
  choices.outputFolder = options.out ? *options.out
                                     : ReadSetting(environment.settings, kOutputPathValue,
                                                   DefaultOutputFolder(environment.shell));
  choices.organized = options.organized.value_or(
      ReadSetting(environment.settings, kOrganizedValue, u"true") == u"true");
  choices.rebuildPlaylists = options.playlistsM3u;
  const std::u16string outputFolder = choices.outputFolder;

  TerminalDisplay display(std::move(choices), environment.terminal, environment.columns, out, err);
  ExportReport report;
  platform::FolderLibrary playlists(
      PathFromText(outputFolder + kPathSeparator + u"Playlists"),
      library ? DescribeCopies(*library, report) : platform::MediaInfoLookup{});
  // The folder library is the whole library here: no desktop program is started.
  ExportContext context{
      display, environment.files, environment.stop, {playlists, platform::SystemClock()}};
  StartExport(library ? &*library : nullptr, context, report).join();

  if (!library) {
    if (!failure.empty()) err << "kestrune-cli: " << failure << '\n';
    return kExitNoDevice;
  }
  if (!report.started) return kExitIncomplete;
  return PrintSummary(report, outputFolder, options.playlistsM3u, out);
}

}  // namespace kestrune::cli
