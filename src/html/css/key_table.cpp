#include "html/css/key_table.h"

#include <algorithm>

namespace kestrune::html::css {

void KeyTable::Reset(std::size_t length) {
  length_ = length;
  count_ = 0;
  keys_.clear();
  std::fill(slots_.begin(), slots_.end(), 0u);
}

std::size_t KeyTable::Hash(const std::uint64_t* key) const {
  std::uint64_t hash = 0x9E3779B97F4A7C15ull;
  for (std::size_t i = 0; i < length_; ++i) {
    hash = (hash ^ key[i]) * 0xBF58476D1CE4E5B9ull;
    hash ^= hash >> 31;
  }
  return static_cast<std::size_t>(hash ^ (hash >> 32));
}

// Keys are a handful of words: a loop, rather than a call to memcmp.
bool KeyTable::Equal(std::uint32_t id, const std::uint64_t* key) const {
  const std::uint64_t* stored = keys_.data() + (id - 1) * length_;
  for (std::size_t i = 0; i < length_; ++i) {
    if (stored[i] != key[i]) return false;
  }
  return true;
}

std::uint32_t KeyTable::IdOf(const std::uint64_t* key) {
  if ((size() + 1) * 2 > slots_.size()) Grow();
  const std::size_t mask = slots_.size() - 1;
  for (std::size_t slot = Hash(key) & mask;; slot = (slot + 1) & mask) {
    const std::uint32_t id = slots_[slot];
    if (id == 0) {
      keys_.insert(keys_.end(), key, key + length_);
      slots_[slot] = static_cast<std::uint32_t>(++count_);
      return slots_[slot];
    }
    if (Equal(id, key)) return id;
  }
}

void KeyTable::Grow() {
  slots_.assign(std::max<std::size_t>(64, slots_.size() * 2), 0u);
  const std::size_t mask = slots_.size() - 1;
  for (std::uint32_t id = 1; id <= size(); ++id) {
    std::size_t slot = Hash(keys_.data() + (id - 1) * length_) & mask;
    while (slots_[slot] != 0) slot = (slot + 1) & mask;
    slots_[slot] = id;
  }
}

}  // namespace kestrune::html::css
