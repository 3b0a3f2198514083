#pragma once

#include <cstdint>
#include <memory>
#include <optional>
#include <string>
#include <string_view>

namespace kestrune::platform {

// The automation objects of a desktop media library, in the shape of the music library's COM
// automation: every call may fail, which an empty answer tells.

// A boolean as the automation answers it: -1 true, 0 false; any other answer is neither.
using AutomationBool = std::int16_t;
inline constexpr AutomationBool kAutomationTrue = -1;
inline constexpr AutomationBool kAutomationFalse = 0;

// Playlist kinds; only user playlists are filled by the export.
inline constexpr std::int32_t kPlaylistKindLibrary = 1;
inline constexpr std::int32_t kPlaylistKindUser = 2;

class MediaTrack {
 public:
  virtual ~MediaTrack() = default;
  // Where the library keeps the track's file; empty when it is no file track or cannot be read.
  virtual std::optional<std::u16string> FileLocation() = 0;
};

class MediaTrackCollection {
 public:
  virtual ~MediaTrackCollection() = default;
  virtual std::optional<std::int32_t> Count() = 0;
  virtual std::unique_ptr<MediaTrack> Item(std::int32_t index) = 0;  // from 1
};

// The progress of adding a file.
class MediaOperationStatus {
 public:
  virtual ~MediaOperationStatus() = default;
  virtual std::optional<AutomationBool> InProgress() = 0;
  virtual std::unique_ptr<MediaTrackCollection> Tracks() = 0;
};

class MediaUserPlaylist {
 public:
  virtual ~MediaUserPlaylist() = default;
  virtual std::optional<AutomationBool> Smart() = 0;
  virtual std::optional<std::u16string> Name() = 0;
  virtual std::unique_ptr<MediaOperationStatus> AddFile(std::u16string_view path) = 0;
};

class MediaPlaylist {
 public:
  virtual ~MediaPlaylist() = default;
  virtual std::optional<std::int32_t> Kind() = 0;
  // The same playlist as a user playlist; empty when it is none.
  virtual std::unique_ptr<MediaUserPlaylist> AsUserPlaylist() = 0;
};

class MediaPlaylistCollection {
 public:
  virtual ~MediaPlaylistCollection() = default;
  virtual std::optional<std::int32_t> Count() = 0;
  virtual std::unique_ptr<MediaPlaylist> Item(std::int32_t index) = 0;  // from 1
};

class MediaSource {
 public:
  virtual ~MediaSource() = default;
  virtual std::unique_ptr<MediaPlaylistCollection> Playlists() = 0;
};

// The playlist of everything in the library.
class MediaLibraryPlaylist {
 public:
  virtual ~MediaLibraryPlaylist() = default;
  virtual std::unique_ptr<MediaOperationStatus> AddFile(std::u16string_view path) = 0;
};

class MediaApplication {
 public:
  virtual ~MediaApplication() = default;
  virtual std::unique_ptr<MediaLibraryPlaylist> LibraryPlaylist() = 0;
  virtual std::unique_ptr<MediaSource> LibrarySource() = 0;
  virtual std::unique_ptr<MediaPlaylist> CreatePlaylist(std::u16string_view name) = 0;
};

struct CreatedApplication {
  std::int32_t result = 0;  // 0 on success, else the system's error code (an HRESULT on Windows)
  std::unique_ptr<MediaApplication> application;
};

// Makes the application object named by a program id.
class MediaLibraryAutomation {
 public:
  virtual ~MediaLibraryAutomation() = default;
  virtual CreatedApplication CreateApplication(std::u16string_view programId) = 0;
};

}  // namespace kestrune::platform
