#include "ui/package/packaged_file.h"

#include <cstdint>
#include <limits>
#include <stdexcept>
#include <utility>

#include "base/bytes.h"
#include "ui/package/blowfish.h"

namespace kestrune::ui {
namespace {

constexpr std::size_t kLengthsSize = 8;

void SetPackageKey(BlowfishCipher& cipher) {
  std::vector<unsigned char> key(2 * kPackageKey.size());
  for (std::size_t i = 0; i < kPackageKey.size(); ++i)
    StoreU16Le(key.data() + 2 * i, kPackageKey[i]);
  cipher.SetKey(key);
}

}  // namespace

std::vector<unsigned char> EncipherFile(std::span<const unsigned char> file) {
  if (file.size() > std::numeric_limits<std::uint32_t>::max() - 7) {
    throw std::length_error("a packaged file must be smaller than 4 GB");
  }
  const auto plain = static_cast<std::uint32_t>(file.size());
  const std::uint32_t stored = (plain + 7) / 8 * 8;
  std::vector<unsigned char> stream(kLengthsSize + stored, 0);
  StoreU32Le(stream.data(), plain);
  StoreU32Le(stream.data() + 4, stored);
  std::copy(file.begin(), file.end(), stream.begin() + kLengthsSize);
  unsigned char* blocks = stream.data() + kLengthsSize;
  BlowfishCipher cipher;
  SetPackageKey(cipher);
  cipher.Encipher(blocks, blocks, stored);
  return stream;
}

std::optional<StoredFile> ReadStoredFile(platform::PackageStream& stream) {
  const std::uint64_t streamSize = stream.Size();
  unsigned char lengths[kLengthsSize];
  if (stream.Read(lengths, kLengthsSize) != kLengthsSize) return std::nullopt;
  StoredFile file;
  file.plainLength = LoadU32Le(lengths);
  const std::uint32_t stored = LoadU32Le(lengths + 4);
  if (stored % 8 != 0 || stored < file.plainLength) return std::nullopt;
  if (streamSize < kLengthsSize || stored > streamSize - kLengthsSize) return std::nullopt;
  file.enciphered.resize(stored);
  if (stream.Read(file.enciphered.data(), stored) != stored) return std::nullopt;
  return file;
}

std::vector<unsigned char> DecipherStoredFile(StoredFile stored) {
  std::vector<unsigned char> bytes = std::move(stored.enciphered);
  BlowfishCipher cipher;
  SetPackageKey(cipher);
  cipher.Decipher(bytes.data(), bytes.data(), bytes.size());
  bytes.resize(stored.plainLength);
  return bytes;
}

}  // namespace kestrune::ui
