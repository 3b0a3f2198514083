#pragma once

#include <cstddef>
#include <random>
#include <vector>

namespace kestrune::test {

// Bytes that repeat for the same seed, so that a failure reproduces.
inline std::vector<unsigned char> RandomBytes(std::size_t size, unsigned seed) {
  std::mt19937 random(seed);
  std::vector<unsigned char> bytes(size);
  for (auto& byte : bytes) byte = static_cast<unsigned char>(random());
  return bytes;
}

}  // namespace kestrune::test
