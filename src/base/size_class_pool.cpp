#include "base/size_class_pool.h"

#include <algorithm>
#include <bit>
#include <new>

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

// A block starts with this header and its free-slot bits; the slots follow. Blocks are aligned
// to their size, so a slot's block is found from the slot's address alone.
struct SizeClassPool::Block {
  static constexpr std::size_t kMaxSlots = kBlockSize / kGranule;
  static constexpr std::size_t kWords = kMaxSlots / 64;

  std::size_t index;      // among its class's blocks
  std::size_t slotSize;
  std::size_t slotCount;
  std::size_t freeCount;
  std::size_t firstWord;  // no word before this one has a free bit
  std::uint64_t freeBits[kWords];

  static constexpr std::size_t kHeader = sizeof(std::size_t) * 5 + sizeof(std::uint64_t) * kWords;
  static constexpr std::size_t kSlotsOffset = (kHeader + kGranule - 1) / kGranule * kGranule;

  static_assert(kSlotsOffset < kBlockSize / 4);

  char* slots() { return reinterpret_cast<char*>(this) + kSlotsOffset; }

  void* Take() {
    std::size_t word = firstWord;
    while (freeBits[word] == 0) ++word;  // freeCount > 0, so a bit is set at or after firstWord
    const int bit = std::countr_zero(freeBits[word]);
    freeBits[word] &= freeBits[word] - 1;
    firstWord = word;
    --freeCount;
    return slots() + (word * 64 + static_cast<std::size_t>(bit)) * slotSize;
  }

  void Give(void* memory) {
    const std::size_t slot = static_cast<std::size_t>(static_cast<char*>(memory) - slots()) / slotSize;
    const std::size_t word = slot / 64;
    freeBits[word] |= std::uint64_t{1} << (slot % 64);
    if (word < firstWord) firstWord = word;
    ++freeCount;
  }
};

SizeClassPool::~SizeClassPool() {
  for (SizeClass& sizeClass : classes_) {
    for (Block* block : sizeClass.blocks) ::operator delete(block, std::align_val_t{kBlockSize});
  }
}

std::size_t SizeClassPool::reserved() const {
  std::size_t blocks = 0;
  for (const SizeClass& sizeClass : classes_) blocks += sizeClass.blocks.size();
  return blocks * kBlockSize;
}

SizeClassPool::Block* SizeClassPool::NewBlock(std::size_t sizeClass) {
  SizeClass& owner = classes_[sizeClass];
  owner.blocks.reserve(owner.blocks.size() + 1);
  auto* block = static_cast<Block*>(::operator new(kBlockSize, std::align_val_t{kBlockSize}));
  block->index = owner.blocks.size();
  block->slotSize = (sizeClass + 1) * kGranule;
  block->slotCount = (kBlockSize - Block::kSlotsOffset) / block->slotSize;
  block->freeCount = block->slotCount;
  block->firstWord = 0;
  for (std::size_t word = 0; word < Block::kWords; ++word) {
    const std::size_t first = word * 64;
    const std::size_t inWord = first >= block->slotCount ? 0 : std::min<std::size_t>(64, block->slotCount - first);
    block->freeBits[word] = inWord == 64 ? ~std::uint64_t{0} : (std::uint64_t{1} << inWord) - 1;
  }
  owner.blocks.push_back(block);
  return block;
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
  auto* block = reinterpret_cast<Block*>(reinterpret_cast<std::uintptr_t>(memory) & ~std::uintptr_t{kBlockSize - 1});
  block->Give(memory);
  SizeClass& owner = classes_[ClassOf(size)];
  if (block->index < owner.firstFree) owner.firstFree = block->index;
}

}  // namespace kestrune
