#include "mkipod/media_files.h"

#include <gtest/gtest.h>

#include "base/bytes.h"

namespace kestrune::mkipod {
namespace {

TEST(ToneWav, IsAPlayableRiffWaveOfTheRightLength) {
  const Bytes wav = ToneWav(440, 1001);
  ASSERT_GE(wav.size(), 44u);
  EXPECT_EQ(std::string(wav.begin(), wav.begin() + 4), "RIFF");
  EXPECT_EQ(std::string(wav.begin() + 8, wav.begin() + 16), "WAVEfmt ");
  const std::uint32_t sampleRate = LoadU32Le(wav.data() + 24);
  const std::uint32_t dataBytes = LoadU32Le(wav.data() + 40);
  EXPECT_EQ(dataBytes, sampleRate * 1001 / 1000);
  EXPECT_EQ(LoadU32Le(wav.data() + 4), wav.size() - 8);
  EXPECT_EQ(wav.size() % 2, 0u);
}

TEST(FillerBytes, DependOnlyOnSizeAndSeed) {
  EXPECT_EQ(FillerBytes(100, 7), FillerBytes(100, 7));
  EXPECT_NE(FillerBytes(100, 7), FillerBytes(100, 8));
  EXPECT_EQ(FillerBytes(0, 7).size(), 0u);
}

}  // namespace
}  // namespace kestrune::mkipod
