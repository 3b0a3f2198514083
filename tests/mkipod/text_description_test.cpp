#include "mkipod/text_description.h"

#include <gtest/gtest.h>

#include "mkipod/device_writer.h"

namespace kestrune::mkipod {
namespace {

TEST(ParseDescription, ReadsEveryItem) {
  const DeviceDescription device = ParseDescription(
      "# a comment\n"
      "device \"My \\\"iPod\\\"\"\n"
      "track id=52 title=\"Caf\xC3\xA9 \\ud800\" artist=Band "
      "location=\":iPod_Control:Music:F00:A.mp3\" "
      "length=1000 size=123 media=tone:440 mhod=6:\"Com poser\" raw-mhod=15:20 utf8 odd=1 "
      "unknown=mhzz:16\r\n"
      "\n"
      "playlist name=\"Road Trip\" ids=52,53,52 master positions\n"
      "dataset type=9 photo unknown=abcd:12\n");
  EXPECT_EQ(device.deviceName, u"My \"iPod\"");
  ASSERT_EQ(device.tracks.size(), 1u);
  const TrackDescription& track = device.tracks[0];
  EXPECT_EQ(track.id, 52u);
  EXPECT_EQ(track.title, (std::u16string{u'C', u'a', u'f', u'\u00E9', u' ', 0xD800}));
  EXPECT_EQ(track.artist, u"Band");
  EXPECT_FALSE(track.album.has_value());
  EXPECT_EQ(track.lengthMs, 1000u);
  EXPECT_EQ(track.size, 123u);
  EXPECT_EQ(track.media, MediaKind::kTone);
  EXPECT_EQ(track.toneHz, 440);
  ASSERT_EQ(track.moreStrings.size(), 1u);
  EXPECT_EQ(track.moreStrings[0].text, u"Com poser");
  EXPECT_EQ(track.rawRecords[0].bodyLength, 20u);
  EXPECT_TRUE(track.utf8);
  EXPECT_EQ(track.oddLengthTypes, std::vector<std::uint32_t>{1});
  EXPECT_EQ(track.unknownRecords[0].tag, "mhzz");
  ASSERT_EQ(device.playlists.size(), 1u);
  EXPECT_EQ(device.playlists[0].itemIds, (std::vector<std::uint32_t>{52, 53, 52}));
  EXPECT_TRUE(device.playlists[0].master);
  EXPECT_TRUE(device.playlists[0].positions);
  ASSERT_EQ(device.moreDataSets.size(), 1u);
  EXPECT_TRUE(device.moreDataSets[0].photoTree);
}

TEST(ParseDescription, NamesTheLineOfAMistake) {
  try {
    ParseDescription("device \"x\"\ntrack id=abc\n");
    FAIL() << "no error";
  } catch (const std::runtime_error& error) {
    EXPECT_STREQ(error.what(), "line 2: not a number: abc");
  }
  EXPECT_THROW(ParseDescription("track title=\"open"), std::runtime_error);
  EXPECT_THROW(ParseDescription("track title=\"\\u12\""), std::runtime_error);
  EXPECT_THROW(ParseDescription("song id=1"), std::runtime_error);
  EXPECT_THROW(ParseDescription("track unknown=toolong:16"), std::runtime_error);
}

TEST(MediaPathFor, StaysInsideTheDeviceFolder) {
  const std::filesystem::path root = "device";
  EXPECT_EQ(MediaPathFor(u":iPod_Control:Music:F01:AB.mp3", root),
            root / "iPod_Control" / "Music" / "F01" / "AB.mp3");
  EXPECT_TRUE(MediaPathFor(u":..:x.mp3", root).empty());
  EXPECT_TRUE(MediaPathFor(u"loose.mp3", root).empty());
  EXPECT_TRUE(MediaPathFor(u"::x.mp3", root).empty());
}

}  // namespace
}  // namespace kestrune::mkipod
