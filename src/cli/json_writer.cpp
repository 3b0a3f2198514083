#include "cli/json_writer.h"

#include <cstdio>

#include "base/utf.h"

namespace kestrune::cli {
namespace {

void AppendEscape(std::string& out, char16_t unit) {
  char escape[8];
  std::snprintf(escape, sizeof escape, "\\u%04x", static_cast<unsigned>(unit));
  out += escape;
}

bool IsHigh(char16_t unit) { return unit >= 0xD800 && unit <= 0xDBFF; }
bool IsLow(char16_t unit) { return unit >= 0xDC00 && unit <= 0xDFFF; }

}  // namespace

std::string JsonString(std::u16string_view text) {
  std::string out = "\"";
  for (std::size_t i = 0; i < text.size(); ++i) {
    const char16_t unit = text[i];
    switch (unit) {
      case u'"':
        out += "\\\"";
        continue;
      case u'\\':
        out += "\\\\";
        continue;
      case u'\n':
        out += "\\n";
        continue;
      case u'\r':
        out += "\\r";
        continue;
      case u'\t':
        out += "\\t";
        continue;
      default:
        break;
    }
    if (unit < 0x20) {
      AppendEscape(out, unit);
    } else if (IsHigh(unit) && i + 1 < text.size() && IsLow(text[i + 1])) {
      out += EncodeUtf8(text.substr(i, 2));
      ++i;
    } else if (IsHigh(unit) || IsLow(unit)) {
      AppendEscape(out, unit);
    } else {
      out += EncodeUtf8(text.substr(i, 1));
    }
  }
  out += '"';
  return out;
}

}  // namespace kestrune::cli
