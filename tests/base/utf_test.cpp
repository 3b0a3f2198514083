#include "base/utf.h"

#include <gtest/gtest.h>

namespace kestrune {
namespace {

TEST(EncodeUtf8, UsesOneToFourBytesByCodePoint) {
  EXPECT_EQ(EncodeUtf8(u"A"), "A");
  EXPECT_EQ(EncodeUtf8(u"\u00E9"), "\xC3\xA9");
  EXPECT_EQ(EncodeUtf8(u"\u07FF"), "\xDF\xBF");
  EXPECT_EQ(EncodeUtf8(u"\u0800"), "\xE0\xA0\x80");
  EXPECT_EQ(EncodeUtf8(u"\u2602"), "\xE2\x98\x82");
  EXPECT_EQ(EncodeUtf8(u"\U0001F3B5"), "\xF0\x9F\x8E\xB5");
  EXPECT_EQ(EncodeUtf8(std::u16string(1, u'\0')), std::string(1, '\0'));
}

TEST(EncodeUtf8, WritesUnpairedSurrogatesInTheirThreeByteForm) {
  EXPECT_EQ(EncodeUtf8(std::u16string{0xD83C}), "\xED\xA0\xBC");
  EXPECT_EQ(EncodeUtf8(std::u16string{0xDFB5, u'x'}), "\xED\xBE\xB5x");
  // A low surrogate before a high one is two unpaired units, not a pair.
  EXPECT_EQ(EncodeUtf8(std::u16string{0xDFB5, 0xD83C}), "\xED\xBE\xB5\xED\xA0\xBC");
  EXPECT_EQ(EncodeUtf8(std::u16string{u'a', 0xD83C}), "a\xED\xA0\xBC");
}

TEST(DecodeUtf8, ReturnsWhatEncodeUtf8Wrote) {
  const std::u16string texts[] = {u"plain", u"Caf\u00E9 \u2602 \U0001F3B5", std::u16string{0xD800},
                                  std::u16string{0xDC00, 0xD800, u'z'}, std::u16string{}};
  for (const std::u16string& text : texts) EXPECT_EQ(DecodeUtf8(EncodeUtf8(text)), text);

  // Runs of ASCII of every length up to beyond the widening buffer, between other characters.
  std::u16string mixed;
  for (std::size_t run = 0; run < 600; run += run < 20 ? 1 : 37) {
    for (std::size_t k = 0; k < run; ++k) mixed.push_back(static_cast<char16_t>(u'a' + (k + run) % 26));
    mixed += run % 2 ? u"\u00E9" : u"\U0001F3B5";
  }
  EXPECT_EQ(DecodeUtf8(EncodeUtf8(mixed)), mixed);
  EXPECT_EQ(DecodeUtf8("abcdefgh\xFFijklmnopqrstu"), u"abcdefgh\uFFFDijklmnopqrstu");
}

TEST(DecodeUtf8, ReplacesEachMalformedByte) {
  EXPECT_EQ(DecodeUtf8("a\x80z"), u"a\uFFFDz");                  // stray continuation byte
  EXPECT_EQ(DecodeUtf8("\xC3"), u"\uFFFD");                      // truncated at the end
  EXPECT_EQ(DecodeUtf8("\xE2\x98z"), u"\uFFFD\uFFFDz");          // truncated in the middle
  EXPECT_EQ(DecodeUtf8("\xC0\xAF"), u"\uFFFD\uFFFD");            // overlong
  EXPECT_EQ(DecodeUtf8("\xE0\x80\xAF"), u"\uFFFD\uFFFD\uFFFD");  // overlong three-byte form
  EXPECT_EQ(DecodeUtf8("\xF4\x90\x80\x80"), u"\uFFFD\uFFFD\uFFFD\uFFFD");  // above U+10FFFF
  EXPECT_EQ(DecodeUtf8("\xFF"), u"\uFFFD");
}

TEST(DecodeUtf16Le, IgnoresAnOddLastByte) {
  const unsigned char bytes[] = {'H', 0, 'i', 0, 0x3C, 0xD8, 'x'};
  EXPECT_EQ(DecodeUtf16Le(bytes, 7), (std::u16string{u'H', u'i', 0xD83C}));
  EXPECT_EQ(DecodeUtf16Le(bytes, 1), u"");
}

}  // namespace
}  // namespace kestrune
