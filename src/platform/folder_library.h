#pragma once

#include <cstdint>
#include <filesystem>
#include <functional>
#include <optional>
#include <string>
#include <vector>

#include "platform/media_library.h"

namespace kestrune::platform {

// What a playlist line says about a file.
struct MediaInfo {
  std::u16string artist;
  std::u16string title;
  std::uint32_t lengthMs = 0;
};

using MediaInfoLookup = std::function<std::optional<MediaInfo>(std::u16string_view path)>;

// A media library kept in a folder, for where no desktop library can be automated. Files stay
// where they are: adding one to the library records it and reports it at its own path. Every
// user playlist is an M3U8 file of the folder (UTF-8, "#EXTM3U", a "#PLAYLIST:" line with its
// name, then "#EXTINF:" length and "artist - title" before each path, written relative to the
// playlist). Existing playlist files are listed whatever the case of their extension and are
// only ever appended to, never truncated.
class FolderLibrary : public MediaLibraryAutomation {
 public:
  explicit FolderLibrary(std::filesystem::path folder, MediaInfoLookup describe = {});

  CreatedApplication CreateApplication(std::u16string_view programId) override;

  const std::filesystem::path& folder() const { return folder_; }
  // The files added to the library, each once, in the order first added.
  const std::vector<std::u16string>& libraryFiles() const { return libraryFiles_; }

 private:
  friend class FolderApplication;
  friend class FolderUserPlaylist;

  std::filesystem::path folder_;
  MediaInfoLookup describe_;
  std::vector<std::u16string> libraryFiles_;
};

}  // namespace kestrune::platform
