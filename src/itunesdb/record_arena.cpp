#include "itunesdb/record_arena.h"

#include <algorithm>

namespace kestrune::itunesdb {

void* RecordArena::AllocateFromNewBlock(std::size_t bytes) {
  // A large request gets a block of its own, so the current block's rest is not wasted. Blocks
  // come from operator new, aligned for any type.
  if (bytes > kLargestBlock / 4) {
    blocks_.push_back(std::make_unique_for_overwrite<std::byte[]>(bytes));
    return blocks_.back().get();
  }
  // Blocks grow from small to large, so that small trees stay small.
  const std::size_t blockSize =
      std::min(kLargestBlock, kFirstBlock << std::min<std::size_t>(blocks_.size(), 8));
  blocks_.push_back(std::make_unique_for_overwrite<std::byte[]>(std::max(blockSize, bytes)));
  next_ = blocks_.back().get() + bytes;
  left_ = std::max(blockSize, bytes) - bytes;
  return blocks_.back().get();
}

}  // namespace kestrune::itunesdb
