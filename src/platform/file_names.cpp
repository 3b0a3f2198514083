#include "platform/file_names.h"

#include <array>

#include "base/text.h"

namespace kestrune::platform {
namespace {

bool IsOnlyDots(std::u16string_view name) {
  return name.find_first_not_of(u'.') == std::u16string_view::npos;
}

bool IsNumberedDevice(std::u16string_view stem, std::u16string_view prefix) {
  if (stem.size() != 4 || !EqualsIgnoringAsciiCase(stem.substr(0, 3), prefix)) return false;
  const char16_t digit = stem[3];
  // Windows counts the superscript digits as device numbers too.
  return (digit >= u'1' && digit <= u'9') || digit == u'\u00B9' || digit == u'\u00B2' ||
         digit == u'\u00B3';
}

}  // namespace

void ReplaceReservedCharacters(std::u16string& name) {
  static constexpr std::u16string_view kReserved = u"\\/:*?\"<>|";
  for (char16_t& unit : name) {
    if (kReserved.find(unit) != std::u16string_view::npos) unit = u'_';
  }
}

bool IsReservedDeviceName(std::u16string_view name) {
  std::u16string_view stem = name.substr(0, name.find(u'.'));
  // "CON .txt" opens the console too: the spaces before the dot do not count.
  while (!stem.empty() && stem.back() == u' ') stem.remove_suffix(1);
  for (std::u16string_view device : {u"CON", u"PRN", u"AUX", u"NUL"}) {
    if (EqualsIgnoringAsciiCase(stem, device)) return true;
  }
  return IsNumberedDevice(stem, u"COM") || IsNumberedDevice(stem, u"LPT");
}

std::u16string MakeNameAcceptable(std::u16string name, std::u16string_view fallback) {
  for (char16_t& unit : name) {
    if (unit < u' ') unit = u'_';
  }
  if (IsOnlyDots(name)) return std::u16string(fallback);
  for (auto it = name.rbegin(); it != name.rend() && (*it == u'.' || *it == u' '); ++it) *it = u'_';
  if (kDeviceNamesReserved && IsReservedDeviceName(name)) name.insert(name.begin(), u'_');
  return name;
}

}  // namespace kestrune::platform
