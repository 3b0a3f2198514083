#include "base/text.h"

#include <gtest/gtest.h>

#include <limits>

#include "base/paths.h"

namespace kestrune {
namespace {

TEST(AsciiUpper, ChangesOnlyAsciiLetters) {
  EXPECT_EQ(AsciiUpper(u"e:\\ipod_control"), u"E:\\IPOD_CONTROL");
  EXPECT_EQ(AsciiUpper(u"\u00E9t\u00E9 \u00DF z{`@"), u"\u00E9T\u00E9 \u00DF Z{`@");
  EXPECT_TRUE(EqualsIgnoringAsciiCase(u"iTunesDB", u"ITUNESDB"));
  EXPECT_FALSE(EqualsIgnoringAsciiCase(u"\u00E9", u"\u00C9"));
  EXPECT_FALSE(EqualsIgnoringAsciiCase(u"abc", u"abcd"));
}

TEST(FormatDecimal, HasNoGroupingAndNoLeadingZeros) {
  EXPECT_EQ(FormatDecimal(std::uint32_t{0}), u"0");
  EXPECT_EQ(FormatDecimal(std::uint32_t{4294967295u}), u"4294967295");
  EXPECT_EQ(FormatDecimal(std::int32_t{-1}), u"-1");
  EXPECT_EQ(FormatDecimal(std::numeric_limits<std::int64_t>::min()), u"-9223372036854775808");
  EXPECT_EQ(FormatDecimal(std::numeric_limits<std::uint64_t>::max()), u"18446744073709551615");
}

TEST(ParseDecimal, AcceptsOnlyWholeNumbersThatFit) {
  EXPECT_EQ(ParseDecimal(u"52"), 52);
  EXPECT_EQ(ParseDecimal(u"-1"), -1);
  EXPECT_EQ(ParseDecimal(u"007"), 7);
  EXPECT_EQ(ParseDecimal(u"9223372036854775807"), std::numeric_limits<std::int64_t>::max());
  EXPECT_EQ(ParseDecimal(u"-9223372036854775808"), std::numeric_limits<std::int64_t>::min());
  EXPECT_EQ(ParseDecimal(u"9223372036854775808"), std::nullopt);
  for (const char16_t* bad : {u"", u"-", u"+1", u" 1", u"1 ", u"1e3", u"\uFF11"}) {
    EXPECT_EQ(ParseDecimal(bad), std::nullopt);
  }
  EXPECT_EQ(ParseDecimalU32(u"4294967295"), 4294967295u);
  EXPECT_EQ(ParseDecimalU32(u"4294967296"), std::nullopt);
  EXPECT_EQ(ParseDecimalU32(u"-0"), std::nullopt);
}

TEST(Paths, CarryEveryUtf16TextThroughAPath) {
  const std::u16string name = u"Caf\u00E9 \U0001F3B5";
  EXPECT_EQ(TextFromPath(PathFromText(name)), name);
#ifndef _WIN32
  // A lone surrogate from a device's database still names one file.
  const std::u16string lone{u'a', 0xD800};
  EXPECT_EQ(TextFromPath(PathFromText(lone)), lone);
#endif
}

}  // namespace
}  // namespace kestrune
