#include "ui/package/blowfish.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <random>
#include <string>
#include <string_view>
#include <vector>

namespace kestrune::ui {
namespace {

using Bytes = std::vector<unsigned char>;

Bytes FromHex(std::string_view hex) {
  Bytes bytes;
  for (std::size_t i = 0; i + 1 < hex.size(); i += 2) {
    bytes.push_back(
        static_cast<unsigned char>(std::stoi(std::string(hex.substr(i, 2)), nullptr, 16)));
  }
  return bytes;
}

// The published vectors write a block as two big-endian 32-bit halves. Our layout reads each
// half little-endian, so a published block becomes ours by reversing the four bytes of each
// half: 01 23 45 67 89 AB CD EF becomes 67 45 23 01 EF CD AB 89. Keys are bytes in both and
// need no change.
Bytes BlockInOurLayout(std::string_view publishedHex) {
  Bytes block = FromHex(publishedHex);
  for (std::size_t half = 0; half < block.size(); half += 4) {
    std::reverse(block.begin() + static_cast<std::ptrdiff_t>(half),
                 block.begin() + static_cast<std::ptrdiff_t>(half + 4));
  }
  return block;
}

Bytes Encipher(const BlowfishCipher& cipher, const Bytes& plain) {
  Bytes out(plain.size());
  EXPECT_TRUE(cipher.Encipher(plain.data(), out.data(), plain.size()));
  return out;
}

Bytes Decipher(const BlowfishCipher& cipher, const Bytes& enciphered) {
  Bytes out(enciphered.size());
  EXPECT_TRUE(cipher.Decipher(enciphered.data(), out.data(), enciphered.size()));
  return out;
}

struct Vector {
  const char* key;
  const char* plain;
  const char* enciphered;
};

// Eric Young's ECB test vectors, as Bruce Schneier publishes them.
constexpr Vector kEcbVectors[] = {
    {"0000000000000000", "0000000000000000", "4EF997456198DD78"},
    {"FFFFFFFFFFFFFFFF", "FFFFFFFFFFFFFFFF", "51866FD5B85ECB8A"},
    {"3000000000000000", "1000000000000001", "7D856F9A613063F2"},
    {"1111111111111111", "1111111111111111", "2466DD878B963C9D"},
    {"0123456789ABCDEF", "1111111111111111", "61F9C3802281B096"},
    {"1111111111111111", "0123456789ABCDEF", "7D0CC630AFDA1EC7"},
    {"FEDCBA9876543210", "0123456789ABCDEF", "0ACEAB0FC6A0A28D"},
    {"7CA110454A1A6E57", "01A1D6D039776742", "59C68245EB05282B"},
    {"0131D9619DC1376E", "5CD54CA83DEF57DA", "B1B8CC0B250F09A0"},
    {"07A1133E4A0B2686", "0248D43806F67172", "1730E5778BEA1DA4"},
    {"3849674C2602319E", "51454B582DDF440A", "A25E7856CF2651EB"},
    {"04B915BA43FEB5B6", "42FD443059577FA2", "353882B109CE8F1A"},
    {"0113B970FD34F2CE", "059B5E0851CF143A", "48F4D0884C379918"},
    {"0170F175468FB5E6", "0756D8E0774761D2", "432193B78951FC98"},
    {"43297FAD38E373FE", "762514B829BF486A", "13F04154D69D1AE5"},
    {"07A7137045DA2A16", "3BDD119049372802", "2EEDDA93FFD39C79"},
    {"04689104C2FD3B2F", "26955F6835AF609A", "D887E0393C2DA6E3"},
    {"37D06BB516CB7546", "164D5E404F275232", "5F99D04F5B163969"},
    {"1F08260D1AC2465E", "6B056E18759F5CCA", "4A057A3B24D3977B"},
    {"584023641ABA6176", "004BD6EF09176062", "452031C1E4FADA8E"},
    {"025816164629B007", "480D39006EE762F2", "7555AE39F59B87BD"},
    {"49793EBC79B3258F", "437540C8698F3CFA", "53C55F9CB49FC019"},
    {"4FB05E1515AB73A7", "072D43A077075292", "7A8E7BFA937E89A3"},
    {"49E95D6D4CA229BF", "02FE55778117F12A", "CF9C5D7A4986ADB5"},
    {"018310DC409B26D6", "1D9D5C5018F728C2", "D1ABB290658BC778"},
    {"1C587F1C13924FEF", "305532286D6F295A", "55CB3774D13EF201"},
    {"0101010101010101", "0123456789ABCDEF", "FA34EC4847B268B2"},
    {"1F1F1F1F0E0E0E0E", "0123456789ABCDEF", "A790795108EA3CAE"},
    {"E0FEE0FEF1FEF1FE", "0123456789ABCDEF", "C39E072D9FAC631D"},
    {"0000000000000000", "FFFFFFFFFFFFFFFF", "014933E0CDAFF6E4"},
    {"FFFFFFFFFFFFFFFF", "0000000000000000", "F21E9A77B71C49BC"},
    {"0123456789ABCDEF", "0000000000000000", "245946885754369A"},
    {"FEDCBA9876543210", "FFFFFFFFFFFFFFFF", "6B5C5A9C5D9E0A5A"},
};

TEST(BlowfishCipher, MatchesThePublishedEcbVectorsInLittleEndianLayout) {
  for (const Vector& vector : kEcbVectors) {
    BlowfishCipher cipher;
    ASSERT_TRUE(cipher.SetKey(FromHex(vector.key)));
    EXPECT_EQ(Encipher(cipher, BlockInOurLayout(vector.plain)), BlockInOurLayout(vector.enciphered))
        << "key " << vector.key;
    EXPECT_EQ(Decipher(cipher, BlockInOurLayout(vector.enciphered)), BlockInOurLayout(vector.plain))
        << "key " << vector.key;
  }
}

// The published key-schedule vectors: keys of 1 to 24 bytes, all prefixes of one key.
TEST(BlowfishCipher, MatchesThePublishedVectorsForEveryKeyLength) {
  const Bytes key = FromHex("F0E1D2C3B4A5968778695A4B3C2D1E0F0011223344556677");
  const char* const enciphered[] = {
      "F9AD597C49DB005E", "E91D21C1D961A6D6", "E9C2B70A1BC65CF3", "BE1E639408640F05",
      "B39E44481BDB1E6E", "9457AA83B1928C0D", "8BB77032F960629D", "E87A244E2CC85E82",
      "15750E7A4F4EC577", "122BA70B3AB64AE0", "3A833C9AFFC537F6", "9409DA87A90F6BF2",
      "884F80625060B8B4", "1F85031C19E11968", "79D9373A714CA34F", "93142887EE3BE15C",
      "03429E838CE2D14B", "A4299E27469FF67B", "AFD5AED1C1BC96A8", "10851C0E3858DA9F",
      "E6F51ED79B9DB21F", "64A6E14AFD36B46F", "80C7D7D45A5479AD", "05044B62FA52D080"};
  for (std::size_t length = 1; length <= key.size(); ++length) {
    BlowfishCipher cipher;
    ASSERT_TRUE(cipher.SetKey(std::span(key.data(), length)));
    EXPECT_EQ(Encipher(cipher, BlockInOurLayout("FEDCBA9876543210")),
              BlockInOurLayout(enciphered[length - 1]))
        << length << " key bytes";
  }
}

TEST(BlowfishCipher, DeciphersWhatItEnciphersForRandomKeysAndData) {
  std::mt19937 random(20240611);
  for (int round = 0; round < 20; ++round) {
    Bytes key(1 + random() % 56);
    for (auto& byte : key) byte = static_cast<unsigned char>(random());
    Bytes plain(8 * (1 + random() % 100));
    for (auto& byte : plain) byte = static_cast<unsigned char>(random());
    BlowfishCipher cipher;
    ASSERT_TRUE(cipher.SetKey(key));
    const Bytes enciphered = Encipher(cipher, plain);
    EXPECT_NE(enciphered, plain);
    EXPECT_EQ(Decipher(cipher, enciphered), plain);

    Bytes inPlace = plain;  // source and target may be one buffer
    ASSERT_TRUE(cipher.Encipher(inPlace.data(), inPlace.data(), inPlace.size()));
    EXPECT_EQ(inPlace, enciphered);
    ASSERT_TRUE(cipher.Decipher(inPlace.data(), inPlace.data(), inPlace.size()));
    EXPECT_EQ(inPlace, plain);
  }
}

TEST(BlowfishCipher, EnciphersEachBlockOnItsOwn) {
  BlowfishCipher cipher;
  ASSERT_TRUE(cipher.SetKey(FromHex("0123456789ABCDEF")));
  const Bytes plain = FromHex(
      "0011223344556677"
      "0011223344556677"
      "0011223344556678");
  const Bytes enciphered = Encipher(cipher, plain);
  EXPECT_TRUE(std::equal(enciphered.begin(), enciphered.begin() + 8, enciphered.begin() + 8));
  EXPECT_FALSE(std::equal(enciphered.begin(), enciphered.begin() + 8, enciphered.begin() + 16));
}

TEST(BlowfishCipher, RefusesPartialBlocksAndEmptyKeys) {
  BlowfishCipher cipher;
  ASSERT_TRUE(cipher.SetKey(FromHex("0123456789ABCDEF")));
  Bytes buffer(15, 0x5A);
  EXPECT_FALSE(cipher.Encipher(buffer.data(), buffer.data(), buffer.size()));
  EXPECT_FALSE(cipher.Decipher(buffer.data(), buffer.data(), buffer.size()));
  EXPECT_EQ(buffer, Bytes(15, 0x5A));

  const Bytes before = Encipher(cipher, Bytes(8, 0));
  EXPECT_FALSE(cipher.SetKey({}));
  EXPECT_EQ(Encipher(cipher, Bytes(8, 0)), before);
}

TEST(BlowfishCipher, EachKeyStartsFromTheInitialTables) {
  BlowfishCipher reused;
  ASSERT_TRUE(reused.SetKey(FromHex("FFFFFFFFFFFFFFFF")));
  ASSERT_TRUE(reused.SetKey(FromHex("0000000000000000")));
  EXPECT_EQ(Encipher(reused, Bytes(8, 0)), BlockInOurLayout("4EF997456198DD78"));
}

}  // namespace
}  // namespace kestrune::ui
