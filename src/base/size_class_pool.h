#pragma once

#include <array>
#include <cstddef>
#include <cstdint>
#include <vector>

namespace kestrune {

// Memory for many small objects of a few sizes that come and go together (the nodes of a big
// table, their layout boxes). Each 16-byte size class has blocks of its own, and a bit per slot
// says whether the slot is free; a slot is always taken from the class's first-made block with
// a free slot, at the lowest free address there. So objects made one after the other lie one
// after the other, even when the memory was freed in another order, and walking what was built
// in order walks memory in order. Freed memory is kept for the next object of its class, never
// given back. Not thread-safe.
class SizeClassPool {
 public:
  // Sanitizer builds take every object from the heap by default, which checks its lifetime.
  static const bool kPoolsByDefault;

  explicit SizeClassPool(bool pooled = kPoolsByDefault) : pooled_(pooled) {}
  SizeClassPool(const SizeClassPool&) = delete;
  SizeClassPool& operator=(const SizeClassPool&) = delete;
  ~SizeClassPool();

  // Aligned as `operator new` aligns; `size` must be given again when the memory is freed.
  void* Allocate(std::size_t size);
  void Deallocate(void* memory, std::size_t size) noexcept;

  // Bytes taken from the heap for blocks so far.
  std::size_t reserved() const;

  static constexpr std::size_t kGranule = 16;
  static constexpr std::size_t kLargest = 1024;  // bigger objects go to the heap one by one
  static constexpr std::size_t kBlockSize = std::size_t{256} << 10;
  // Regions are cut from chunks of a huge page's size, which Linux is asked to back with huge
  // pages: a tree of a hundred thousand nodes then needs few address translations.
  static constexpr std::size_t kChunkSize = std::size_t{2} << 20;

 private:
  struct Block;
  struct SizeClass {
    std::vector<Block*> blocks;  // in the order they were made
    std::size_t firstFree = 0;   // no block before this one has a free slot
  };
  static constexpr std::size_t kClasses = kLargest / kGranule;

  static std::size_t ClassOf(std::size_t size) { return size == 0 ? 0 : (size - 1) / kGranule; }
  Block* NewBlock(std::size_t sizeClass);
  char* NewRegion();

  bool pooled_;
  std::array<SizeClass, kClasses> classes_;
  std::vector<void*> chunks_;  // regions are cut from these, a few at a time
  std::size_t regionsLeft_ = 0;
};

}  // namespace kestrune
