#include "base/utf.h"

#include <algorithm>
#include <bit>
#include <cstdint>
#include <iterator>
#include <cstring>

namespace kestrune {
namespace {

bool IsHighSurrogate(char32_t unit) { return unit >= 0xD800 && unit <= 0xDBFF; }
bool IsLowSurrogate(char32_t unit) { return unit >= 0xDC00 && unit <= 0xDFFF; }

void AppendUtf8(std::string& out, char32_t codePoint) {
  auto byte = [&out](char32_t value) { out.push_back(static_cast<char>(value)); };
  if (codePoint < 0x80) {
    byte(codePoint);
  } else if (codePoint < 0x800) {
    byte(0xC0 | (codePoint >> 6));
    byte(0x80 | (codePoint & 0x3F));
  } else if (codePoint < 0x10000) {
    byte(0xE0 | (codePoint >> 12));
    byte(0x80 | ((codePoint >> 6) & 0x3F));
    byte(0x80 | (codePoint & 0x3F));
  } else {
    byte(0xF0 | (codePoint >> 18));
    byte(0x80 | ((codePoint >> 12) & 0x3F));
    byte(0x80 | ((codePoint >> 6) & 0x3F));
    byte(0x80 | (codePoint & 0x3F));
  }
}

}  // namespace

void AppendUtf16(std::u16string& out, char32_t codePoint) {
  if (codePoint < 0x10000) {
    out.push_back(static_cast<char16_t>(codePoint));
  } else {
    codePoint -= 0x10000;
    out.push_back(static_cast<char16_t>(0xD800 + (codePoint >> 10)));
    out.push_back(static_cast<char16_t>(0xDC00 + (codePoint & 0x3FF)));
  }
}

std::string EncodeUtf8(std::u16string_view text) {
  std::string out;
  out.reserve(text.size());
  for (std::size_t i = 0; i < text.size(); ++i) {
    char32_t unit = text[i];
    if (unit < 0x80) {
      out.push_back(static_cast<char>(unit));
      continue;
    }
    if (IsHighSurrogate(unit) && i + 1 < text.size() && IsLowSurrogate(text[i + 1])) {
      char32_t low = text[++i];
      AppendUtf8(out, 0x10000 + ((unit - 0xD800) << 10) + (low - 0xDC00));
    } else {
      AppendUtf8(out, unit);
    }
  }
  return out;
}

std::u16string DecodeUtf8(std::string_view bytes) {
  std::u16string out;
  out.reserve(bytes.size());
  const std::size_t size = bytes.size();
  std::size_t i = 0;
  while (i < size) {
    const auto lead = static_cast<unsigned char>(bytes[i]);
    if (lead < 0x80) {
      // A run of ASCII, the bulk of any page: found eight bytes at a time, widened through a
      // small buffer that stays in the cache.
      std::size_t end = i + 1;
      while (end + 8 <= size) {
        std::uint64_t word;
        std::memcpy(&word, bytes.data() + end, sizeof word);
        if (word & 0x8080808080808080ull) break;
        end += 8;
      }
      while (end < size && static_cast<unsigned char>(bytes[end]) < 0x80) ++end;
      char16_t wide[256];
      while (i < end) {
        const std::size_t count = std::min(end - i, std::size(wide));
        std::size_t k = 0;
        for (; std::endian::native == std::endian::little && k + 8 <= count; k += 8) {
          std::uint64_t word;
          std::memcpy(&word, bytes.data() + i + k, sizeof word);
          for (std::size_t b = 0; b < 8; ++b) wide[k + b] = static_cast<char16_t>((word >> (8 * b)) & 0xFF);
        }
        for (; k < count; ++k) wide[k] = static_cast<unsigned char>(bytes[i + k]);
        out.append(wide, count);
        i += count;
      }
      continue;
    }
    std::size_t length = 0;
    char32_t value = 0;
    char32_t minimum = 0;
    if (lead >= 0xC2 && lead <= 0xDF) {
      length = 2, value = lead & 0x1F, minimum = 0x80;
    } else if (lead >= 0xE0 && lead <= 0xEF) {
      length = 3, value = lead & 0x0F, minimum = 0x800;
    } else if (lead >= 0xF0 && lead <= 0xF4) {
      length = 4, value = lead & 0x07, minimum = 0x10000;
    }
    bool valid = length != 0 && i + length <= size;
    for (std::size_t k = 1; valid && k < length; ++k) {
      const auto next = static_cast<unsigned char>(bytes[i + k]);
      if ((next & 0xC0) != 0x80) {
        valid = false;
      } else {
        value = (value << 6) | (next & 0x3F);
      }
    }
    if (!valid || value < minimum || value > 0x10FFFF) {
      out.push_back(u'\uFFFD');
      ++i;
      continue;
    }
    AppendUtf16(out, value);
    i += length;
  }
  return out;
}

std::u16string DecodeUtf16Le(const unsigned char* bytes, std::size_t byteCount) {
  std::u16string out(byteCount / 2, u'\0');
  if constexpr (std::endian::native == std::endian::little) {
    std::memcpy(out.data(), bytes, out.size() * 2);
  } else {
    for (std::size_t i = 0; i < out.size(); ++i) {
      out[i] = static_cast<char16_t>(bytes[2 * i] | (bytes[2 * i + 1] << 8));
    }
  }
  return out;
}

}  // namespace kestrune
