#include "itunesdb/record_format.h"

#include <gtest/gtest.h>

namespace kestrune::itunesdb {
namespace {

TEST(RecordFormat, TagsAreTheirBytesInFileOrder) {
  EXPECT_EQ(kTagMhbd, 0x6462686Du);  // 6D 68 62 64 read little-endian
  EXPECT_EQ(TagText(kTagMhod), "mhod");
  EXPECT_EQ(TagText(0x0001FF6Du), "m???");
}

TEST(RecordFormat, EachKnownTagHasItsKind) {
  EXPECT_EQ(ShapeOf(kTagMhbd).kind, RecordKind::kList);
  EXPECT_EQ(ShapeOf(kTagMhbd).countOffset, 20u);
  EXPECT_EQ(ShapeOf(kTagMhfd).countOffset, 20u);
  for (std::uint32_t tag : {kTagMhlt, kTagMhlp, kTagMhli, kTagMhla, kTagMhlf}) {
    EXPECT_EQ(ShapeOf(tag).kind, RecordKind::kList) << TagText(tag);
    EXPECT_EQ(ShapeOf(tag).countOffset, 8u) << TagText(tag);
  }
  for (std::uint32_t tag :
       {kTagMhsd, kTagMhit, kTagMhyp, kTagMhip, kTagMhii, kTagMhni, kTagMhba, kTagMhia, kTagMhif}) {
    EXPECT_EQ(ShapeOf(tag).kind, RecordKind::kLength) << TagText(tag);
  }
  EXPECT_EQ(ShapeOf(kTagMhod).kind, RecordKind::kString);
}

TEST(RecordFormat, TagsMatchOnAllFourBytesAndCase) {
  EXPECT_EQ(ShapeOf(TagValue("MHSD")).kind, RecordKind::kUnknown);
  EXPECT_EQ(ShapeOf(TagValue("mhsx")).kind, RecordKind::kUnknown);
  EXPECT_EQ(ShapeOf(TagValue("xhsd")).kind, RecordKind::kUnknown);
}

}  // namespace
}  // namespace kestrune::itunesdb
