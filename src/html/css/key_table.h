#pragma once

#include <cstddef>
#include <cstdint>
#include <vector>

namespace kestrune::html::css {

// Numbers keys of a fixed number of words: the first key seen is 1, the next new one 2, and so
// on. Open addressing over a power-of-two table: a lookup is a multiply per word and a mask, no
// division and no allocation once the table has grown to its size.
class KeyTable {
 public:
  // Forgets every key; later keys have `length` words.
  void Reset(std::size_t length);
  std::uint32_t IdOf(const std::uint64_t* key);
  std::size_t size() const { return count_; }

 private:
  std::size_t Hash(const std::uint64_t* key) const;
  bool Equal(std::uint32_t id, const std::uint64_t* key) const;
  void Grow();

  std::size_t length_ = 0;
  std::size_t count_ = 0;
  std::vector<std::uint64_t> keys_;  // key of id n at (n - 1) * length_
  std::vector<std::uint32_t> slots_;  // 0 when free, else the id of the key there
};

}  // namespace kestrune::html::css
