#pragma once

#include <string>
#include <string_view>

namespace kestrune {

// UTF-16 to UTF-8. A surrogate pair becomes one four-byte sequence; an unpaired surrogate
// unit is written in its three-byte form rather than dropped, so no text is ever lost.
std::string EncodeUtf8(std::u16string_view text);

// UTF-8 to UTF-16. Three-byte forms of surrogate units (as EncodeUtf8 writes them) come back
// as those units, so EncodeUtf8 followed by DecodeUtf8 returns the original text. Any other
// malformed sequence (stray continuation byte, truncated or overlong form, value above
// U+10FFFF) becomes one U+FFFD per offending byte.
std::u16string DecodeUtf8(std::string_view bytes);

// Appends a code point (at most U+10FFFF) as one UTF-16 unit or a surrogate pair.
void AppendUtf16(std::u16string& out, char32_t codePoint);

// Appends UTF-16LE bytes (no terminator) as UTF-16 code units; an odd last byte is ignored.
std::u16string DecodeUtf16Le(const unsigned char* bytes, std::size_t byteCount);

}  // namespace kestrune
