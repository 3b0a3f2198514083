#pragma once

#include <chrono>
#include <cstdint>
#include <map>
#include <memory>
#include <string>
#include <string_view>
#include <vector>

#include "export/export_display.h"
#include "library/track.h"
#include "platform/clock.h"
#include "platform/files.h"
#include "platform/media_library.h"
#include "platform/settings_store.h"
#include "platform/shell.h"

namespace kestrune {

// Track id to the full path of its copy, in ascending id: what an export made.
using CopiedFiles = std::map<std::uint32_t, std::u16string>;

inline constexpr std::u16string_view kSyncingTitle = u"Syncing music back to iTunes ";
inline constexpr std::u16string_view kAddingTitle = u"Adding music to iTunes master playlist ";
inline constexpr std::u16string_view kRebuildingTitle = u"Rebuilding playlist ";
inline constexpr std::u16string_view kPleaseWait = u"Please wait......";
inline constexpr std::u16string_view kLibraryProgramId = u"iTunes.Application";
inline constexpr std::u16string_view kLibraryMissingText =
    u"Failed to sync music/video/playlist back to iTunes.\r\nPlease make sure you have iTunes "
    u"installed on your computer!";
inline constexpr std::u16string_view kLibraryMissingTitle = u"iTunes not found!";
inline constexpr std::u16string_view kLibraryExecutable = u"\\iTunes\\iTunes.exe";
inline constexpr std::u16string_view kLibraryAppPathsKey =
    u"SOFTWARE\\Microsoft\\Windows\\CurrentVersion\\App Paths\\iTunes.exe";

// How long one added file may stay in progress before it is passed over, and the pause between
// two looks at it.
inline constexpr std::chrono::seconds kOperationTimeLimit{60};
inline constexpr std::chrono::milliseconds kOperationPoll{10};

// What finding and starting the desktop library's program needs.
struct LibraryLauncher {
  platform::Shell& shell;
  platform::SettingsStore& settings;
  platform::Files& files;
};

struct LibrarySyncContext {
  platform::MediaLibraryAutomation& automation;
  platform::Clock& clock;
  // The desktop library's program is started first when given; a folder library needs none.
  const LibraryLauncher* launcher = nullptr;
};

// Adds every copied file to the desktop library, taking the location the library reports for
// it, then extends (or creates) one user playlist per device playlist with its copied tracks.
// Nothing is ever removed from the library. Exceptions end the stage and are dropped.
void SyncToItunes(CopiedFiles& copiedFiles, const std::vector<Playlist>& playlists,
                  ExportDisplay& display, const LibrarySyncContext& context);

// The first user playlist that is not smart and whose name equals `name` in any ASCII letter
// case, else a new playlist of that name; empty when neither can be had.
std::unique_ptr<platform::MediaUserPlaylist> FindOrCreateUserPlaylist(
    platform::MediaApplication* application, std::u16string_view name);

// Starts the library's program when its executable is found below Program Files or through its
// App Paths entry; does not wait for it.
void LaunchItunes(const LibraryLauncher& launcher);

}  // namespace kestrune
