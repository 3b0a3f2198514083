#include "cli/options.h"

#include <limits>

#include "base/text.h"
#include "base/utf.h"

namespace kestrune::cli {

const char* const kUsage =
    "usage: kestrune-cli devices\n"
    "       kestrune-cli list [--device DIR] [--playlist INDEX] [--json]\n"
    "       kestrune-cli export [--device DIR] [--out DIR] [--organized | --flat] "
    "[--playlists-m3u]\n"
    "                           (--all | --playlist INDEX | --search TEXT | --ids ID,ID...)\n";

namespace {

// "52,53": track ids, none empty.
std::optional<std::vector<std::uint32_t>> ParseIds(std::u16string_view list) {
  std::vector<std::uint32_t> ids;
  std::size_t start = 0;
  for (;;) {
    const std::size_t comma = list.find(u',', start);
    const auto id = ParseDecimalU32(
        list.substr(start, comma == std::u16string_view::npos ? comma : comma - start));
    if (!id) return std::nullopt;
    ids.push_back(*id);
    if (comma == std::u16string_view::npos) return ids;
    start = comma + 1;
  }
}

// Takes the export option at `i` (and its value); false when it is none of them. A mistake
// leaves its explanation in `error`.
bool ParseExportArgument(const std::vector<std::u16string>& arguments, std::size_t& i,
                         Options& options, std::string& error) {
  const std::u16string& argument = arguments[i];
  const bool hasValue = i + 1 < arguments.size();
  if (argument == u"--organized" || argument == u"--flat") {
    options.organized = argument == u"--organized";
  } else if (argument == u"--all") {
    options.all = true;
  } else if (argument == u"--playlists-m3u") {
    options.playlistsM3u = true;
  } else if (argument == u"--out" && hasValue) {
    options.out = arguments[++i];
  } else if (argument == u"--search" && hasValue) {
    options.search = arguments[++i];
    if (options.search->empty()) error = "--search takes a text that is not empty";
  } else if (argument == u"--ids" && hasValue) {
    auto ids = ParseIds(arguments[++i]);
    if (!ids)
      error = "--ids takes track ids separated by commas, like 52,53";
    else
      options.ids = std::move(*ids);
  } else {
    return false;
  }
  return true;
}

}  // namespace

std::optional<Options> ParseOptions(const std::vector<std::u16string>& arguments,
                                    std::string& error) {
  Options options;
  if (arguments.empty()) return options;
  const std::u16string& command = arguments.front();
  if (command == u"devices") {
    options.command = Command::kDevices;
  } else if (command == u"list") {
    options.command = Command::kList;
  } else if (command == u"export") {
    options.command = Command::kExport;
  } else if (command == u"help" || command == u"--help" || command == u"-h") {
    return options;
  } else {
    error = "unknown command: " + EncodeUtf8(command);
    return std::nullopt;
  }

  for (std::size_t i = 1; i < arguments.size(); ++i) {
    const std::u16string& argument = arguments[i];
    const bool hasValue = i + 1 < arguments.size();
    const bool exporting = options.command == Command::kExport;
    if (exporting && ParseExportArgument(arguments, i, options, error)) {
      if (!error.empty()) return std::nullopt;
    } else if (argument == u"--json" && options.command == Command::kList) {
      options.json = true;
    } else if (argument == u"--device" && hasValue) {
      options.device = arguments[++i];
    } else if (argument == u"--playlist" && hasValue && options.command != Command::kDevices) {
      const auto index = ParseDecimal(arguments[++i]);
      if (!index || *index < -1 || *index > std::numeric_limits<std::int32_t>::max()) {
        error = "--playlist takes a playlist number from 0, or -1 for the whole device";
        return std::nullopt;
      }
      options.playlist = static_cast<std::int32_t>(*index);
    } else {
      error = "unexpected argument: " + EncodeUtf8(argument);
      return std::nullopt;
    }
  }
  if (options.command == Command::kExport) {
    const int choices = (options.all ? 1 : 0) + (options.playlist ? 1 : 0) +
                        (options.search ? 1 : 0) + (options.ids.empty() ? 0 : 1);
    if (choices != 1) {
      error =
          "export takes exactly one of --all, --playlist INDEX, --search TEXT and --ids ID,ID...";
      return std::nullopt;
    }
  }
  return options;
}

}  // namespace kestrune::cli
