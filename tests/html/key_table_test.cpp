#include "html/css/key_table.h"

#include <gtest/gtest.h>

#include <array>

namespace kestrune::html::css {
namespace {

TEST(KeyTable, NumbersKeysInTheOrderFirstSeenAcrossGrowthAndReset) {
  KeyTable table;
  table.Reset(3);
  // Keys that differ in one word only, and enough of them to grow the table many times.
  for (std::uint64_t i = 0; i < 5000; ++i) {
    const std::array<std::uint64_t, 3> key{i % 7, i, i % 3 == 0 ? 0 : ~i};
    ASSERT_EQ(table.IdOf(key.data()), i + 1);
  }
  EXPECT_EQ(table.size(), 5000u);
  for (std::uint64_t i = 0; i < 5000; i += 37) {
    const std::array<std::uint64_t, 3> key{i % 7, i, i % 3 == 0 ? 0 : ~i};
    EXPECT_EQ(table.IdOf(key.data()), i + 1);
  }
  const std::array<std::uint64_t, 3> swapped{1, 0, 0};  // the words of the first key but one, moved
  EXPECT_EQ(table.IdOf(swapped.data()), 5001u);

  table.Reset(2);
  const std::array<std::uint64_t, 2> first{4, 4};
  const std::array<std::uint64_t, 2> second{0, 0};
  EXPECT_EQ(table.IdOf(first.data()), 1u);
  EXPECT_EQ(table.IdOf(second.data()), 2u);
  EXPECT_EQ(table.IdOf(first.data()), 1u);
  EXPECT_EQ(table.size(), 2u);
}

}  // namespace
}  // namespace kestrune::html::css
