// The database reader and the library loader on arbitrary bytes: either a library or a
// MalformedDatabase, never a crash, a hang or a read outside a buffer.
#include <cstdint>
#include <cstdio>

#include "itunesdb/record_format.h"
#include "library/track_library.h"

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  std::FILE* stream = fmemopen(const_cast<std::uint8_t*>(data), size, "rb");
  if (stream == nullptr) return 0;
  try {
    kestrune::TrackLibrary library(u"/device");
    if (library.ReadDatabase(stream)) {
      for (const auto& [id, track] : library.tracks()) {
        if (track.trackId != id) __builtin_trap();
      }
      for (const auto& playlist : library.playlists()) {
        for (const auto& [id, same] : playlist.trackIds) {
          if (!library.tracks().contains(id)) __builtin_trap();
        }
      }
    }
  } catch (const kestrune::itunesdb::MalformedDatabase&) {
  }
  std::fclose(stream);
  return 0;
}
