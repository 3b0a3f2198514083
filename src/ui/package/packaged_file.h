#pragma once

#include <cstdint>
#include <optional>
#include <span>
#include <string_view>
#include <vector>

#include "platform/embedded_package.h"

namespace kestrune::ui {

// The key every package stream is enciphered under: a fixed text of 21 characters, used as
// its 42 UTF-16LE bytes.
inline constexpr std::u16string_view kPackageKey = u"Kestrune interface v1";
static_assert(kPackageKey.size() == 21);

// A file as a package stream holds it: the plain length P and the stored length S (P rounded
// up to a multiple of 8) as little-endian 32-bit words, then the file padded with zeros to S
// bytes and enciphered in ECB mode under the package key. Throws std::length_error for a file
// of 4 GB or more.
std::vector<unsigned char> EncipherFile(std::span<const unsigned char> file);

struct StoredFile {
  std::uint32_t plainLength = 0;
  std::vector<unsigned char> enciphered;  // S bytes
};

// The stored form read from a package stream. None when the stream is shorter than 8 bytes, S
// is not a multiple of 8, S is below P, or the stream holds fewer than S bytes after the
// lengths; the lengths are checked against the stream's size before anything is allocated.
std::optional<StoredFile> ReadStoredFile(platform::PackageStream& stream);

// The file itself: the S bytes deciphered, of which the first P are kept.
std::vector<unsigned char> DecipherStoredFile(StoredFile stored);

}  // namespace kestrune::ui
