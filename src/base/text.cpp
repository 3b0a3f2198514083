#include "base/text.h"

#include <limits>

namespace kestrune {

char16_t AsciiUpper(char16_t unit) {
  return (unit >= u'a' && unit <= u'z') ? static_cast<char16_t>(unit - (u'a' - u'A')) : unit;
}

char16_t AsciiLower(char16_t unit) {
  return (unit >= u'A' && unit <= u'Z') ? static_cast<char16_t>(unit + (u'a' - u'A')) : unit;
}

std::u16string AsciiUpper(std::u16string_view text) {
  std::u16string out(text);
  for (char16_t& unit : out) unit = AsciiUpper(unit);
  return out;
}

bool EqualsIgnoringAsciiCase(std::u16string_view a, std::u16string_view b) {
  if (a.size() != b.size()) return false;
  for (std::size_t i = 0; i < a.size(); ++i) {
    if (AsciiUpper(a[i]) != AsciiUpper(b[i])) return false;
  }
  return true;
}

std::u16string FormatDecimal(std::uint64_t value) {
  char16_t digits[20];
  std::size_t count = 0;
  do {
    digits[count++] = static_cast<char16_t>(u'0' + value % 10);
    value /= 10;
  } while (value != 0);
  std::u16string out;
  out.reserve(count);
  while (count > 0) out.push_back(digits[--count]);
  return out;
}

std::u16string FormatDecimal(std::int64_t value) {
  if (value >= 0) return FormatDecimal(static_cast<std::uint64_t>(value));
  // Negate in unsigned arithmetic so that the smallest value does not overflow.
  const auto magnitude = std::uint64_t{0} - static_cast<std::uint64_t>(value);
  return u"-" + FormatDecimal(magnitude);
}

std::u16string FormatDecimal(std::uint32_t value) { return FormatDecimal(std::uint64_t{value}); }
std::u16string FormatDecimal(std::int32_t value) { return FormatDecimal(std::int64_t{value}); }

std::optional<std::int64_t> ParseDecimal(std::u16string_view text) {
  bool negative = !text.empty() && text.front() == u'-';
  if (negative) text.remove_prefix(1);
  if (text.empty()) return std::nullopt;
  const std::uint64_t limit =
      negative ? std::uint64_t{1} << 63 : std::uint64_t{std::numeric_limits<std::int64_t>::max()};
  std::uint64_t value = 0;
  for (char16_t unit : text) {
    if (unit < u'0' || unit > u'9') return std::nullopt;
    const std::uint64_t digit = unit - u'0';
    if (value > (limit - digit) / 10) return std::nullopt;
    value = value * 10 + digit;
  }
  if (negative) return static_cast<std::int64_t>(std::uint64_t{0} - value);
  return static_cast<std::int64_t>(value);
}

std::optional<std::uint32_t> ParseDecimalU32(std::u16string_view text) {
  if (!text.empty() && text.front() == u'-') return std::nullopt;
  auto value = ParseDecimal(text);
  if (!value || *value > std::numeric_limits<std::uint32_t>::max()) return std::nullopt;
  return static_cast<std::uint32_t>(*value);
}

std::u16string AsciiToUtf16(std::string_view ascii) {
  return std::u16string(ascii.begin(), ascii.end());
}

}  // namespace kestrune
