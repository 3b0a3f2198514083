#pragma once

#include <cstddef>
#include <cstdint>
#include <memory>
#include <span>

namespace kestrune::ui {

// The published Blowfish cipher (64-bit blocks, 16 rounds) in ECB mode, with one difference in
// byte order: each block's halves are read and stored as little-endian 32-bit words (bytes 0–3
// the left half, 4–7 the right), where the published description is big-endian.
class BlowfishCipher {
 public:
  BlowfishCipher();  // allocates the P-array and the S-boxes
  ~BlowfishCipher();
  BlowfishCipher(const BlowfishCipher&) = delete;
  BlowfishCipher& operator=(const BlowfishCipher&) = delete;

  // Runs the key schedule from the initial tables: the key bytes cycle over the P-array (the
  // first of four bytes most significant), then zero blocks are enciphered into P and S.
  // False, leaving the state as it was, for an empty key.
  bool SetKey(std::span<const unsigned char> key);

  // Whole 8-byte blocks, each on its own; source and target may be the same buffer. False, with
  // nothing written, when length is not a multiple of 8.
  bool Encipher(const unsigned char* source, unsigned char* target, std::size_t length) const;
  bool Decipher(const unsigned char* source, unsigned char* target, std::size_t length) const;

 private:
  struct State;
  void EncipherHalves(std::uint32_t& left, std::uint32_t& right) const;
  void DecipherHalves(std::uint32_t& left, std::uint32_t& right) const;

  std::unique_ptr<State> state_;
};

}  // namespace kestrune::ui
