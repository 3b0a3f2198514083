#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>

namespace kestrune {

// Only a–z change; every other unit, including non-ASCII letters, stays as it is.
std::u16string AsciiUpper(std::u16string_view text);
char16_t AsciiUpper(char16_t unit);
char16_t AsciiLower(char16_t unit);

// True when both texts are equal after ASCII-only upper-casing.
bool EqualsIgnoringAsciiCase(std::u16string_view a, std::u16string_view b);

// Decimal digits, no grouping, no leading zeros, '-' in front of negative numbers.
std::u16string FormatDecimal(std::int64_t value);
std::u16string FormatDecimal(std::uint64_t value);
std::u16string FormatDecimal(std::uint32_t value);
std::u16string FormatDecimal(std::int32_t value);

// Whole text must be an optional '-' and one or more ASCII digits that fit the type.
std::optional<std::int64_t> ParseDecimal(std::u16string_view text);
std::optional<std::uint32_t> ParseDecimalU32(std::u16string_view text);

// ASCII text literal as UTF-16 (for messages built from narrow program texts).
std::u16string AsciiToUtf16(std::string_view ascii);

}  // namespace kestrune
