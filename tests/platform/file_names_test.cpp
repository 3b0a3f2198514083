#include "platform/file_names.h"

#include <gtest/gtest.h>

namespace kestrune::platform {
namespace {

TEST(FileNames, KnowsWindowsDeviceNamesWithAndWithoutExtension) {
  for (const char16_t* name :
       {u"CON", u"con", u"Nul.mp3", u"aux.tar.gz", u"COM1", u"lpt9.txt", u"PRN .x", u"com\u00B9"}) {
    EXPECT_TRUE(IsReservedDeviceName(name)) << std::string(name, name + 3);
  }
  for (const char16_t* name :
       {u"CONSOLE", u"COM0", u"COM10", u"LPT", u"xcon", u"_CON", u"Null.mp3", u""}) {
    EXPECT_FALSE(IsReservedDeviceName(name));
  }
}

TEST(FileNames, MakesNamesThatStayInTheirFolder) {
  EXPECT_EQ(MakeNameAcceptable(u"", u"Fallback"), u"Fallback");
  EXPECT_EQ(MakeNameAcceptable(u"..", u"Fallback"), u"Fallback");
  EXPECT_EQ(MakeNameAcceptable(u"a. .", u"Fallback"), u"a___");
  EXPECT_EQ(MakeNameAcceptable(u"a\x1F"
                               u"b",
                               u"Fallback"),
            u"a_b");
  EXPECT_EQ(MakeNameAcceptable(u"AUX", u"Fallback"), kDeviceNamesReserved ? u"_AUX" : u"AUX");
  std::u16string reserved = u"a/b\\c:d*e?f\"g<h>i|j";
  ReplaceReservedCharacters(reserved);
  EXPECT_EQ(reserved, u"a_b_c_d_e_f_g_h_i_j");
}

}  // namespace
}  // namespace kestrune::platform
