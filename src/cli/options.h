#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <vector>

namespace kestrune::cli {

enum class Command { kHelp, kDevices, kList, kExport };

struct Options {
  Command command = Command::kHelp;
  std::optional<std::u16string> device;  // --device DIR
  std::optional<std::int32_t> playlist;  // --playlist INDEX, -1 for the whole device
  bool json = false;                     // --json

  // export
  std::optional<std::u16string> out;     // --out DIR
  std::optional<bool> organized;         // --organized or --flat
  std::optional<std::u16string> search;  // --search TEXT
  std::vector<std::uint32_t> ids;        // --ids 52,53
  bool all = false;                      // --all
  bool playlistsM3u = false;             // --playlists-m3u
};

// Parses the arguments after the program name; on a mistake `error` says what is wrong.
std::optional<Options> ParseOptions(const std::vector<std::u16string>& arguments,
                                    std::string& error);

extern const char* const kUsage;

}  // namespace kestrune::cli
