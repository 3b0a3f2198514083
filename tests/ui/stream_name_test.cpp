#include "ui/package/stream_name.h"

#include <gtest/gtest.h>

namespace kestrune::ui {
namespace {

// Expected names: Python's hashlib.md5 over the upper-cased name's UTF-16LE bytes, 30 digits.
TEST(StreamNameFor, IsTheFirst30DigitsOfTheUpperCasedNamesDigest) {
  EXPECT_EQ(StreamNameFor(u"main.htm"), u"7d5e059c0414a4591d6fdbc9056c2f");
  EXPECT_EQ(StreamNameFor(u"styles/main.css"), u"bb65f54ce1cf6f6645a4a9542eac01");
  EXPECT_EQ(StreamNameFor(u"images/logo.png"), u"591b849cc7987806f4fdf10812973b");
  EXPECT_EQ(StreamNameFor(u""), u"d41d8cd98f00b204e9800998ecf842");
}

TEST(StreamNameFor, FoldsOnlyAsciiLetters) {
  EXPECT_EQ(StreamNameFor(u"MAIN.HTM"), StreamNameFor(u"main.htm"));
  EXPECT_EQ(StreamNameFor(u"Styles/Main.CSS"), StreamNameFor(u"styles/main.css"));
  EXPECT_EQ(StreamNameFor(u"main.htm "), u"777f191471c30b54306838b0e0cf8d");
  EXPECT_NE(StreamNameFor(u"main.htm "), StreamNameFor(u"main.htm"));
  // Letters outside a–z keep their case: é and É name different files.
  EXPECT_EQ(StreamNameFor(u"\u00e9.htm"), u"565b0235444ecda5f79f41316c740e");
  EXPECT_EQ(StreamNameFor(u"\u00c9.htm"), u"bbf761ae671e5c2f11e4c5dfc303b4");
}

}  // namespace
}  // namespace kestrune::ui
