#include "cli/options.h"

#include <limits>

#include "base/text.h"
#include "base/utf.h"

namespace kestrune::cli {

const char* const kUsage =
    "usage: kestrune-cli devices\n"
    "       kestrune-cli list [--device DIR] [--playlist INDEX] [--json]\n";

std::optional<Options> ParseOptions(const std::vector<std::u16string>& arguments,
                                    std::string& error) {
  Options options;
  if (arguments.empty()) return options;
  const std::u16string& command = arguments.front();
  if (command == u"devices") {
    options.command = Command::kDevices;
  } else if (command == u"list") {
    options.command = Command::kList;
  } else if (command == u"help" || command == u"--help" || command == u"-h") {
    return options;
  } else {
    error = "unknown command: " + EncodeUtf8(command);
    return std::nullopt;
  }

  for (std::size_t i = 1; i < arguments.size(); ++i) {
    const std::u16string& argument = arguments[i];
    const bool hasValue = i + 1 < arguments.size();
    if (argument == u"--json" && options.command == Command::kList) {
      options.json = true;
    } else if (argument == u"--device" && hasValue) {
      options.device = arguments[++i];
    } else if (argument == u"--playlist" && hasValue && options.command == Command::kList) {
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
  return options;
}

}  // namespace kestrune::cli
