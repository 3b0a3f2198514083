#include "export/library_sync.h"

#include <exception>

#include "base/paths.h"
#include "base/text.h"
#include "export/settings.h"

namespace kestrune {
namespace {

void ShowSyncProgress(ExportDisplay& display, std::u16string_view title, std::size_t step,
                      std::size_t total) {
  display.ShowProgress(MakeProgress(title, static_cast<std::uint32_t>(step),
                                    static_cast<std::uint32_t>(total), kPleaseWait));
}

// Done (false), or empty when the answer cannot be read, is neither true nor false, or the
// operation is still running when the time limit has passed.
bool WaitForOperation(platform::MediaOperationStatus& status, platform::Clock& clock) {
  const auto start = clock.Now();
  std::optional<platform::AutomationBool> running = status.InProgress();
  while (running == platform::kAutomationTrue) {
    if (clock.Now() - start >= kOperationTimeLimit) return false;
    clock.Pause(kOperationPoll);
    running = status.InProgress();
  }
  return running == platform::kAutomationFalse;
}

// The library's own location of the one track an added file became.
std::optional<std::u16string> AddedLocation(platform::MediaOperationStatus& status) {
  const std::unique_ptr<platform::MediaTrackCollection> tracks = status.Tracks();
  if (!tracks || tracks->Count() != 1) return std::nullopt;
  const std::unique_ptr<platform::MediaTrack> track = tracks->Item(1);
  if (!track) return std::nullopt;
  std::optional<std::u16string> location = track->FileLocation();
  if (location && location->empty()) return std::nullopt;
  return location;
}

void AddToLibrary(platform::MediaApplication& application, CopiedFiles& copiedFiles,
                  ExportDisplay& display, platform::Clock& clock) {
  const std::unique_ptr<platform::MediaLibraryPlaylist> library = application.LibraryPlaylist();
  if (!library) return;
  std::size_t step = 0;
  for (auto& [trackId, path] : copiedFiles) {
    ShowSyncProgress(display, kAddingTitle, ++step, copiedFiles.size());
    const std::unique_ptr<platform::MediaOperationStatus> status = library->AddFile(path);
    if (!status || !WaitForOperation(*status, clock)) continue;
    if (std::optional<std::u16string> location = AddedLocation(*status))
      path = std::move(*location);
  }
}

void RebuildPlaylists(platform::MediaApplication& application, const CopiedFiles& copiedFiles,
                      const std::vector<Playlist>& playlists, ExportDisplay& display) {
  std::size_t step = 0;
  for (const Playlist& playlist : playlists) {
    ShowSyncProgress(display, kRebuildingTitle, ++step, playlists.size());
    const std::unique_ptr<platform::MediaUserPlaylist> target =
        FindOrCreateUserPlaylist(&application, playlist.name);
    if (!target) continue;
    for (const auto& [trackId, sameId] : playlist.trackIds) {
      const auto copied = copiedFiles.find(trackId);
      if (copied != copiedFiles.end()) target->AddFile(copied->second);
    }
  }
}

std::unique_ptr<platform::MediaUserPlaylist> MatchingUserPlaylist(
    platform::MediaPlaylistCollection& playlists, std::u16string_view name) {
  const std::int32_t count = playlists.Count().value_or(0);
  for (std::int32_t index = 1; index <= count; ++index) {
    const std::unique_ptr<platform::MediaPlaylist> item = playlists.Item(index);
    if (!item || item->Kind() != platform::kPlaylistKindUser) continue;
    std::unique_ptr<platform::MediaUserPlaylist> user = item->AsUserPlaylist();
    if (!user || user->Smart() != platform::kAutomationFalse) continue;
    const std::optional<std::u16string> itemName = user->Name();
    if (itemName && EqualsIgnoringAsciiCase(*itemName, name)) return user;
  }
  return nullptr;
}

}  // namespace

void SyncToItunes(CopiedFiles& copiedFiles, const std::vector<Playlist>& playlists,
                  ExportDisplay& display, const LibrarySyncContext& context) {
  try {
    ShowSyncProgress(display, kSyncingTitle, 1, copiedFiles.size());
    if (context.launcher != nullptr) LaunchItunes(*context.launcher);
    platform::CreatedApplication created = context.automation.CreateApplication(kLibraryProgramId);
    if (created.result != 0 || !created.application) {
      display.ShowMessage(kLibraryMissingText, kLibraryMissingTitle);
      return;
    }
    AddToLibrary(*created.application, copiedFiles, display, context.clock);
    RebuildPlaylists(*created.application, copiedFiles, playlists, display);
  } catch (const std::exception&) {
    // The copies stay; the job goes on to its end.
  }
}

std::unique_ptr<platform::MediaUserPlaylist> FindOrCreateUserPlaylist(
    platform::MediaApplication* application, std::u16string_view name) {
  if (application == nullptr) return nullptr;
  const std::unique_ptr<platform::MediaSource> source = application->LibrarySource();
  if (!source) return nullptr;
  if (const std::unique_ptr<platform::MediaPlaylistCollection> playlists = source->Playlists()) {
    if (std::unique_ptr<platform::MediaUserPlaylist> found = MatchingUserPlaylist(*playlists, name))
      return found;
  }
  const std::unique_ptr<platform::MediaPlaylist> created = application->CreatePlaylist(name);
  if (!created) return nullptr;
  return created->AsUserPlaylist();
}

void LaunchItunes(const LibraryLauncher& launcher) {
  const std::optional<std::u16string> programFiles =
      launcher.shell.SpecialFolderPath(platform::SpecialFolder::kProgramFiles);
  if (!programFiles) return;
  std::u16string candidate = *programFiles + std::u16string(kLibraryExecutable);
  if (!launcher.files.FileExists(PathFromText(candidate))) {
    candidate = ReadRegistryString(launcher.settings, platform::RegistryRoot::kLocalMachine,
                                   kLibraryAppPathsKey, u"", candidate);
  }
  if (launcher.files.FileExists(PathFromText(candidate)))
    launcher.shell.Run(u"\"" + candidate + u"\"");
}

}  // namespace kestrune
