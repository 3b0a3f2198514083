#include "ui/package/md5.h"

#include <gtest/gtest.h>

#include <string_view>
#include <vector>

#include "base/text.h"

namespace kestrune::ui {
namespace {

std::u16string Md5Of(std::string_view text) {
  return Md5Digest(std::span(reinterpret_cast<const unsigned char*>(text.data()), text.size()));
}

TEST(Md5Digest, PassesTheRfc1321TestSuite) {
  EXPECT_EQ(Md5Of(""), u"d41d8cd98f00b204e9800998ecf8427e");
  EXPECT_EQ(Md5Of("a"), u"0cc175b9c0f1b6a831c399e269772661");
  EXPECT_EQ(Md5Of("abc"), u"900150983cd24fb0d6963f7d28e17f72");
  EXPECT_EQ(Md5Of("message digest"), u"f96b697d7cb7938d525a2f31aaf161d0");
  EXPECT_EQ(Md5Of("abcdefghijklmnopqrstuvwxyz"), u"c3fcd3d76192e4007dfb496cca67e13b");
  EXPECT_EQ(Md5Of("ABCDEFGHIJKLMNOPQRSTUVWXYZabcdefghijklmnopqrstuvwxyz0123456789"),
            u"d174ab98d277d9f5a5611c2c9f419d9f");
  EXPECT_EQ(Md5Of("1234567890123456789012345678901234567890"
                  "1234567890123456789012345678901234567890"),
            u"57edf4a22be3c955ac49da2e2107b67a");
}

// The padding takes one block or two depending on how much of the last block is left; the
// expected digests are Python's hashlib over the same bytes.
TEST(Md5Digest, PadsCorrectlyAroundBlockBoundaries) {
  const std::vector<std::pair<std::size_t, std::u16string>> cases = {
      {55, u"52c0e574e1198de5fe3f8f11440dcb1b"},  {56, u"46c9907fc908ee68b1e7b8e71286a518"},
      {57, u"1c805dd236c35cab25fcb1bc73802c51"},  {63, u"a62f6d59e837867693f042f5b8f5a236"},
      {64, u"7160b8fb5e9e4023d549c3971fbaeead"},  {65, u"70bd662e7aefbda85a0f7244167b7897"},
      {119, u"e84905d4214f4d1ca56c2cdcc152b143"}, {120, u"e3eb5a6c8669ea01a8c185b8abc8a5dc"},
      {128, u"10b2da1a82f16d99a81a7203fe9f02cb"}};
  for (const auto& [length, digest] : cases) {
    std::vector<unsigned char> bytes(length);
    for (std::size_t i = 0; i < length; ++i) bytes[i] = static_cast<unsigned char>(i * 7 + 3);
    EXPECT_EQ(Md5Digest(bytes), digest) << length << " bytes";
  }
  EXPECT_EQ(Md5Digest(std::vector<unsigned char>(1000000, 'a')),
            u"7707d6ae4e027c70eea2a935c2296f21");
}

}  // namespace
}  // namespace kestrune::ui
