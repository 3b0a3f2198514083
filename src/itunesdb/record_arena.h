#pragma once

#include <cstddef>
#include <cstdint>
#include <memory>
#include <vector>

namespace kestrune::itunesdb {

// Memory for one record tree: records and child lists are carved from large blocks and freed
// together when the tree goes. A database holds hundreds of thousands of small records; making
// and freeing each on the heap cost more than reading them.
class RecordArena {
 public:
  RecordArena() = default;
  RecordArena(RecordArena&&) noexcept = default;
  RecordArena& operator=(RecordArena&&) noexcept = default;

  // Uninitialized memory that stays put until the arena is destroyed. `alignment` is a power
  // of two.
  void* Allocate(std::size_t bytes, std::size_t alignment) {
    const std::size_t padding =
        (alignment - reinterpret_cast<std::uintptr_t>(next_)) & (alignment - 1);
    if (padding + bytes <= left_) [[likely]] {
      std::byte* result = next_ + padding;
      next_ = result + bytes;
      left_ -= padding + bytes;
      return result;
    }
    return AllocateFromNewBlock(bytes);
  }

  template <typename T>
  T* AllocateArray(std::size_t count) {
    return static_cast<T*>(Allocate(count * sizeof(T), alignof(T)));
  }

 private:
  void* AllocateFromNewBlock(std::size_t bytes);

  static constexpr std::size_t kFirstBlock = std::size_t{1} << 12;
  static constexpr std::size_t kLargestBlock = std::size_t{1} << 20;

  std::vector<std::unique_ptr<std::byte[]>> blocks_;
  std::byte* next_ = nullptr;
  std::size_t left_ = 0;
};

}  // namespace kestrune::itunesdb
