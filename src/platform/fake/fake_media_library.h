#pragma once

#include <map>
#include <set>
#include <string>
#include <vector>

#include "platform/media_library.h"

namespace kestrune::platform {

// A media library whose answers tests script and whose calls it records.
class FakeMediaLibrary : public MediaLibraryAutomation {
 public:
  struct Playlist {
    std::u16string name;
    std::int32_t kind = kPlaylistKindUser;
    bool smart = false;
    std::vector<std::u16string> files;  // as added, in order
  };

  CreatedApplication CreateApplication(std::u16string_view programId) override;

  // Script.
  std::int32_t createResult = 0;  // nonzero: the application cannot be created
  bool refuseLibraryPlaylist = false;
  bool refuseLibrarySource = false;
  bool refusePlaylists = false;
  bool refuseCreatePlaylist = false;
  std::set<std::u16string> refusedFiles;                 // adding gives no operation
  std::map<std::u16string, std::u16string> relocations;  // where the library files an added file
  std::map<std::u16string, int> busyReads;  // reads of "in progress" before done; -1 never done
  std::map<std::u16string, AutomationBool> oddProgress;  // "in progress" answers this instead
  std::map<std::u16string, std::int32_t> trackCounts;  // tracks an operation reports (1 otherwise)
  std::vector<Playlist> playlists;

  // Record.
  std::vector<std::u16string> programIds;
  std::vector<std::u16string> libraryFiles;
  std::vector<std::u16string> createdPlaylists;
  int progressReads = 0;
};

}  // namespace kestrune::platform
