#pragma once

#include <cstddef>
#include <string>
#include <string_view>

namespace kestrune::html::parse {

// Decodes the character reference that starts at text[at] ('&'). On success appends the
// character(s) to out and returns the length consumed; returns 0 when there is no valid
// reference there, and the caller keeps the '&' as text.
std::size_t DecodeCharacterReference(std::u16string_view text, std::size_t at, std::u16string& out);

// Appends a code point as UTF-16; values that are not characters become U+FFFD.
void AppendCodePoint(char32_t code, std::u16string& out);

}  // namespace kestrune::html::parse
