#include "base/size_class_pool.h"

#include <algorithm>
#include <bit>
#include <memory>
#include <new>

#if defined(__linux__)
#include <sys/mman.h>
#endif

#if defined(__SANITIZE_ADDRESS__)
#define KESTRUNE_POOLED 0
#elif defined(__has_feature)
#if __has_feature(address_sanitizer)
#define KESTRUNE_POOLED 0
#endif
#endif
#ifndef KESTRUNE_POOLED
#define KESTRUNE_POOLED 1
#endif

namespace kestrune {

const bool SizeClassPool::kPoolsByDefault = KESTRUNE_POOLED != 0;

constexpr std::size_t kCacheLine = 64;

// A block's slots lie in a region of the block's size, aligned to it, whose first cache line
// points back to the block: a slot's block is found from the slot's address alone. The slots
// start at the next line, so that objects of a multiple of the line's size straddle no more
// lines than they must. The block's own fields and free-slot bits live apart on the heap, since
// the regions' starts all fall on the same cache sets and would evict one another.
struct SizeClassPool::Block {
  static constexpr std::size_t kMaxSlots = kBlockSize / kGranule;
  static constexpr std::size_t kWords = kMaxSlots / 64;

  char* slots;
  std::size_t index;         // among its class's blocks
  std::uint32_t slotSize;
  std::uint32_t reciprocal;  // 2^32 / slotSize, rounded up: offset / slotSize without a division
  std::size_t freeCount;
  std::size_t firstWord;     // no word before this one has a free bit
  std::uint64_t freeBits[kWords];

  static Block* Of(void* memory) {
    return *reinterpret_cast<Block**>(reinterpret_cast<std::uintptr_t>(memory) & ~std::uintptr_t{kBlockSize - 1});
  }

  void* Take() {
    std::size_t word = firstWord;
    while (freeBits[word] == 0) ++word;  // freeCount > 0, so a bit is set at or after firstWord
    const int bit = std::countr_zero(freeBits[word]);
    freeBits[word] &= freeBits[word] - 1;
    firstWord = word;
    --freeCount;
    return slots + (word * 64 + static_cast<std::size_t>(bit)) * slotSize;
  }

  void Give(void* memory) {
    // Offsets stay below 2^18 and sizes below 2^11, so the product rounds to the exact quotient.
    const auto offset = static_cast<std::uint64_t>(static_cast<char*>(memory) - slots);
    const std::size_t slot = static_cast<std::size_t>((offset * reciprocal) >> 32);
    const std::size_t word = slot / 64;
    freeBits[word] |= std::uint64_t{1} << (slot % 64);
    if (word < firstWord) firstWord = word;
    ++freeCount;
  }
};

SizeClassPool::~SizeClassPool() {
  for (SizeClass& sizeClass : classes_) {
    for (Block* block : sizeClass.blocks) delete block;
  }
  for (void* chunk : chunks_) ::operator delete(chunk, std::align_val_t{kChunkSize});
}

char* SizeClassPool::NewRegion() {
  if (regionsLeft_ == 0) {
    chunks_.reserve(chunks_.size() + 1);
    void* chunk = ::operator new(kChunkSize, std::align_val_t{kChunkSize});
#if defined(__linux__)
    madvise(chunk, kChunkSize, MADV_HUGEPAGE);  // only advice: without it, ordinary pages
#endif
    chunks_.push_back(chunk);
    regionsLeft_ = kChunkSize / kBlockSize;
  }
  --regionsLeft_;
  return static_cast<char*>(chunks_.back()) + (kChunkSize / kBlockSize - 1 - regionsLeft_) * kBlockSize;
}

std::size_t SizeClassPool::reserved() const {
  std::size_t blocks = 0;
  for (const SizeClass& sizeClass : classes_) blocks += sizeClass.blocks.size();
  return blocks * kBlockSize;
}

SizeClassPool::Block* SizeClassPool::NewBlock(std::size_t sizeClass) {
  SizeClass& owner = classes_[sizeClass];
  owner.blocks.reserve(owner.blocks.size() + 1);
  auto block = std::make_unique<Block>();
  char* region = NewRegion();
  *reinterpret_cast<Block**>(region) = block.get();
  block->slots = region + kCacheLine;
  block->index = owner.blocks.size();
  block->slotSize = static_cast<std::uint32_t>((sizeClass + 1) * kGranule);
  block->reciprocal = static_cast<std::uint32_t>(((std::uint64_t{1} << 32) + block->slotSize - 1) / block->slotSize);
  const std::size_t slotCount = (kBlockSize - kCacheLine) / block->slotSize;
  block->freeCount = slotCount;
  block->firstWord = 0;
  for (std::size_t word = 0; word < Block::kWords; ++word) {
    const std::size_t first = word * 64;
    const std::size_t inWord = first >= slotCount ? 0 : std::min<std::size_t>(64, slotCount - first);
    block->freeBits[word] = inWord == 64 ? ~std::uint64_t{0} : (std::uint64_t{1} << inWord) - 1;
  }
  owner.blocks.push_back(block.get());
  return block.release();
}

void* SizeClassPool::Allocate(std::size_t size) {
  if (!pooled_ || size > kLargest) return ::operator new(size);
  const std::size_t sizeClass = ClassOf(size);
  SizeClass& owner = classes_[sizeClass];
  while (owner.firstFree < owner.blocks.size() && owner.blocks[owner.firstFree]->freeCount == 0) ++owner.firstFree;
  Block* block = owner.firstFree < owner.blocks.size() ? owner.blocks[owner.firstFree] : NewBlock(sizeClass);
  return block->Take();
}

void SizeClassPool::Deallocate(void* memory, std::size_t size) noexcept {
  if (memory == nullptr) return;
  if (!pooled_ || size > kLargest) {
    ::operator delete(memory);
    return;
  }
  Block* block = Block::Of(memory);
  block->Give(memory);
  SizeClass& owner = classes_[ClassOf(size)];
  if (block->index < owner.firstFree) owner.firstFree = block->index;
}

}  // namespace kestrune
