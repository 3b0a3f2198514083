#include "ui/package/md5.h"

#include <array>
#include <bit>
#include <cstdint>

#include "base/bytes.h"

namespace kestrune::ui {
namespace {

// The integer part of 2^32 × |sin(i + 1)|, for i from 0 to 63.
constexpr std::array<std::uint32_t, 64> kSines = {
    0xD76AA478, 0xE8C7B756, 0x242070DB, 0xC1BDCEEE, 0xF57C0FAF, 0x4787C62A, 0xA8304613, 0xFD469501,
    0x698098D8, 0x8B44F7AF, 0xFFFF5BB1, 0x895CD7BE, 0x6B901122, 0xFD987193, 0xA679438E, 0x49B40821,
    0xF61E2562, 0xC040B340, 0x265E5A51, 0xE9B6C7AA, 0xD62F105D, 0x02441453, 0xD8A1E681, 0xE7D3FBC8,
    0x21E1CDE6, 0xC33707D6, 0xF4D50D87, 0x455A14ED, 0xA9E3E905, 0xFCEFA3F8, 0x676F02D9, 0x8D2A4C8A,
    0xFFFA3942, 0x8771F681, 0x6D9D6122, 0xFDE5380C, 0xA4BEEA44, 0x4BDECFA9, 0xF6BB4B60, 0xBEBFBC70,
    0x289B7EC6, 0xEAA127FA, 0xD4EF3085, 0x04881D05, 0xD9D4D039, 0xE6DB99E5, 0x1FA27CF8, 0xC4AC5665,
    0xF4292244, 0x432AFF97, 0xAB9423A7, 0xFC93A039, 0x655B59C3, 0x8F0CCC92, 0xFFEFF47D, 0x85845DD1,
    0x6FA87E4F, 0xFE2CE6E0, 0xA3014314, 0x4E0811A1, 0xF7537E82, 0xBD3AF235, 0x2AD7D2BB, 0xEB86D391};

// Left rotations of each round, four per round.
constexpr std::array<std::array<int, 4>, 4> kShifts = {
    {{7, 12, 17, 22}, {5, 9, 14, 20}, {4, 11, 16, 23}, {6, 10, 15, 21}}};

void Compress(std::array<std::uint32_t, 4>& state, const unsigned char* block) {
  std::array<std::uint32_t, 16> words;
  for (std::size_t i = 0; i < 16; ++i) words[i] = LoadU32Le(block + 4 * i);
  std::uint32_t a = state[0], b = state[1], c = state[2], d = state[3];
  for (std::size_t step = 0; step < 64; ++step) {
    const std::size_t round = step / 16;
    std::uint32_t mixed;
    std::size_t word;
    switch (round) {
      case 0:
        mixed = (b & c) | (~b & d);
        word = step;
        break;
      case 1:
        mixed = (d & b) | (~d & c);
        word = (5 * step + 1) % 16;
        break;
      case 2:
        mixed = b ^ c ^ d;
        word = (3 * step + 5) % 16;
        break;
      default:
        mixed = c ^ (b | ~d);
        word = (7 * step) % 16;
        break;
    }
    const std::uint32_t sum = a + mixed + kSines[step] + words[word];
    a = d;
    d = c;
    c = b;
    b += std::rotl(sum, kShifts[round][step % 4]);
  }
  state[0] += a;
  state[1] += b;
  state[2] += c;
  state[3] += d;
}

}  // namespace

std::u16string Md5Digest(std::span<const unsigned char> bytes) {
  std::array<std::uint32_t, 4> state = {0x67452301, 0xEFCDAB89, 0x98BADCFE, 0x10325476};
  const std::size_t whole = bytes.size() - bytes.size() % 64;
  for (std::size_t at = 0; at < whole; at += 64) Compress(state, bytes.data() + at);

  // The tail, a single 1 bit, zeros up to 56 bytes into a block, and the bit length.
  std::array<unsigned char, 128> tail{};
  const std::size_t left = bytes.size() - whole;
  for (std::size_t i = 0; i < left; ++i) tail[i] = bytes[whole + i];
  tail[left] = 0x80;
  const std::size_t tailLength = left < 56 ? 64 : 128;
  const std::uint64_t bits = static_cast<std::uint64_t>(bytes.size()) * 8;
  StoreU32Le(tail.data() + tailLength - 8, static_cast<std::uint32_t>(bits));
  StoreU32Le(tail.data() + tailLength - 4, static_cast<std::uint32_t>(bits >> 32));
  for (std::size_t at = 0; at < tailLength; at += 64) Compress(state, tail.data() + at);

  static constexpr char16_t kDigits[] = u"0123456789abcdef";
  std::u16string digest;
  for (const std::uint32_t word : state) {
    for (int i = 0; i < 4; ++i) {
      const auto byte = static_cast<unsigned char>(word >> (8 * i));
      digest += kDigits[byte >> 4];
      digest += kDigits[byte & 0xF];
    }
  }
  return digest;
}

}  // namespace kestrune::ui
