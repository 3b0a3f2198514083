#include "base/size_class_pool.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <cstdint>
#include <cstring>
#include <random>
#include <vector>

namespace kestrune {
namespace {

std::uintptr_t Address(const void* memory) { return reinterpret_cast<std::uintptr_t>(memory); }

std::vector<void*> AllocateMany(SizeClassPool& pool, std::size_t count, std::size_t size) {
  std::vector<void*> slots;
  for (std::size_t i = 0; i < count; ++i) slots.push_back(pool.Allocate(size));
  return slots;
}

// Enough slots of 144 bytes to fill several blocks.
constexpr std::size_t kMany = 5000;

TEST(SizeClassPool, SlotsAreAlignedDistinctAndKeepTheirContents) {
  SizeClassPool pool(true);
  std::vector<std::pair<void*, std::size_t>> taken;
  for (std::size_t size : {1u, 8u, 16u, 17u, 40u, 144u, 1000u, 1024u, 1025u, 4096u}) {
    for (int i = 0; i < 300; ++i) taken.emplace_back(pool.Allocate(size), size);
  }
  for (std::size_t i = 0; i < taken.size(); ++i) {
    EXPECT_EQ(Address(taken[i].first) % alignof(std::max_align_t), 0u);
    std::memset(taken[i].first, static_cast<int>(i % 251), taken[i].second);
  }
  for (std::size_t i = 0; i < taken.size(); ++i) {
    const auto* bytes = static_cast<const unsigned char*>(taken[i].first);
    ASSERT_TRUE(std::all_of(bytes, bytes + taken[i].second, [&](unsigned char b) { return b == i % 251; })) << i;
  }
  std::sort(taken.begin(), taken.end());
  for (std::size_t i = 1; i < taken.size(); ++i) {
    EXPECT_GE(Address(taken[i].first), Address(taken[i - 1].first) + taken[i - 1].second);
  }
  for (auto [memory, size] : taken) pool.Deallocate(memory, size);
}

TEST(SizeClassPool, FreedSlotsComeBackInTheOrderTheyWereFirstMadeWhateverTheOrderOfFreeing) {
  SizeClassPool pool(true);
  std::vector<void*> slots = AllocateMany(pool, kMany, 144);
  const std::size_t reserved = pool.reserved();
  EXPECT_GE(reserved, kMany * 144);

  std::vector<void*> freed = slots;
  std::shuffle(freed.begin(), freed.end(), std::mt19937(7));
  for (void* memory : freed) pool.Deallocate(memory, 144);
  // Sizes of one class share the slots.
  std::vector<void*> again = AllocateMany(pool, kMany, 137);
  EXPECT_EQ(again, slots);
  EXPECT_EQ(pool.reserved(), reserved);

  // A freed slot in an early block is taken before any later free slot.
  pool.Deallocate(again[kMany - 1], 144);
  pool.Deallocate(again[10], 144);
  EXPECT_EQ(pool.Allocate(144), again[10]);
  EXPECT_EQ(pool.Allocate(144), again[kMany - 1]);
  EXPECT_NE(pool.Allocate(144), again[10]);
}

TEST(SizeClassPool, ClassesAndLargeObjectsStayApart) {
  SizeClassPool pool(true);
  void* small = pool.Allocate(16);
  void* other = pool.Allocate(32);
  const std::size_t reserved = pool.reserved();
  EXPECT_EQ(reserved, 2 * SizeClassPool::kBlockSize);
  void* large = pool.Allocate(SizeClassPool::kLargest + 1);
  EXPECT_EQ(pool.reserved(), reserved);  // from the heap, not from a block
  std::memset(large, 0xAB, SizeClassPool::kLargest + 1);
  pool.Deallocate(large, SizeClassPool::kLargest + 1);
  pool.Deallocate(other, 32);
  EXPECT_EQ(pool.Allocate(32), other);
  EXPECT_NE(pool.Allocate(16), small);
}

TEST(SizeClassPool, WithoutPoolingEveryObjectComesFromTheHeap) {
  SizeClassPool pool(false);
  std::vector<void*> slots = AllocateMany(pool, 100, 64);
  EXPECT_EQ(pool.reserved(), 0u);
  for (void* memory : slots) pool.Deallocate(memory, 64);
}

}  // namespace
}  // namespace kestrune
