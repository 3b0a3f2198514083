#include "export/naming.h"

#include <gtest/gtest.h>

#include "base/paths.h"
#include "platform/system.h"
#include "support/temp_folder.h"

namespace kestrune {
namespace {

const std::u16string kSep(1, kPathSeparator);

TEST(SanitizeName, CutsTrimsAndReplacesAsTheSteps) {
  // The 40th unit is a space: cut to 40, the space goes, so 39 units remain.
  const std::u16string longTitle = u"abcdefghij abcdefghij abcdefghij abcdef xyz";
  EXPECT_EQ(SanitizeName(longTitle), u"abcdefghij abcdefghij abcdefghij abcdef");
  EXPECT_EQ(SanitizeName(longTitle).size(), 39u);
  EXPECT_EQ(SanitizeName(u"   "), u"Unknown");
  EXPECT_EQ(SanitizeName(u""), u"Unknown");
  EXPECT_EQ(SanitizeName(u"AC/DC: Live?"), u"AC_DC_ Live_");
  EXPECT_EQ(SanitizeName(u"a\\b*c\"d<e>f|g"), u"a_b_c_d_e_f_g");
  EXPECT_EQ(SanitizeName(u"\ttab "), u"_tab");  // only U+0020 is trimmed; the tab is cleaned later
}

TEST(SanitizeName, NeverLeavesItsFolderOrGivesARefusedName) {
  EXPECT_EQ(SanitizeName(u"."), u"Unknown");
  EXPECT_EQ(SanitizeName(u".."), u"Unknown");
  EXPECT_EQ(SanitizeName(u" ... "), u"Unknown");
  EXPECT_EQ(SanitizeName(u"Dots..."), u"Dots___");
  EXPECT_EQ(SanitizeName(u"..hidden"), u"..hidden");
  EXPECT_EQ(SanitizeName(u"line\nbreak\x01"), u"line_break_");
  // Cut at 40, the 40th unit a space and the 39th a dot: both cleaned, nothing trailing left.
  EXPECT_EQ(SanitizeName(std::u16string(38, u'x') + u". tail"), std::u16string(38, u'x') + u"_");
#ifdef _WIN32
  EXPECT_EQ(SanitizeName(u"CON"), u"_CON");
  EXPECT_EQ(SanitizeName(u"lpt1.live"), u"_lpt1.live");
#else
  EXPECT_EQ(SanitizeName(u"CON"), u"CON");
#endif
  EXPECT_EQ(SanitizeName(u"Conan"), u"Conan");
}

TEST(SanitizeName, DropsTheFirstHalfOfASurrogatePairTheCutSplits) {
  const std::u16string note = u"\U0001F3B5";
  const std::u16string split = std::u16string(39, u'a') + note + u"b";
  EXPECT_EQ(SanitizeName(split), std::u16string(39, u'a'));
  const std::u16string whole = std::u16string(38, u'a') + note + u"b";
  EXPECT_EQ(SanitizeName(whole), std::u16string(38, u'a') + note);
}

TEST(BaseNameFor, DropsTheDeviceExtensionInAnyCase) {
  EXPECT_EQ(BaseNameFor(u"Song.MP3", u".mp3"), u"Song");
  EXPECT_EQ(BaseNameFor(u"Song.mp3", u".MP3"), u"Song");
  EXPECT_EQ(BaseNameFor(u".mp3", u".mp3"), u".mp3");  // only as long as the extension: kept whole
  EXPECT_EQ(BaseNameFor(u"Song.mp3", u""), u"Song.mp3");
  EXPECT_EQ(BaseNameFor(u"Song.wav", u".mp3"), u"Song.wav");
}

TEST(FolderNames, UseFixedNamesOnlyForEmptyTexts) {
  Track track;
  EXPECT_EQ(ArtistFolderName(track), u"Unknown Artist");
  EXPECT_EQ(AlbumFolderName(track), u"Unknown Album");
  track.artist = u"   ";
  track.album = std::u16string(45, u'z');
  EXPECT_EQ(ArtistFolderName(track), u"Unknown");
  EXPECT_EQ(AlbumFolderName(track), std::u16string(40, u'z'));
}

TEST(ExtensionOf, TakesTheLastDotOfTheLastComponent) {
  EXPECT_EQ(ExtensionOf(u"E:" + kSep + u"F00" + kSep + u"ABCD.mp3"), u".mp3");
  EXPECT_EQ(ExtensionOf(u"x" + kSep + u"a.b.M4A"), u".M4A");
  EXPECT_EQ(ExtensionOf(u"dir.d" + kSep + u"noext"), u"");
  EXPECT_EQ(ExtensionOf(u"name."), u".");
  EXPECT_EQ(ExtensionOf(u""), u"");
}

class TargetPathTest : public ::testing::Test {
 protected:
  Track MakeTrack(std::u16string title, std::uint32_t size) {
    Track track;
    track.title = std::move(title);
    track.artist = u"Artist";
    track.album = u"Album";
    track.fileSize = size;
    return track;
  }

  std::u16string Target(const Track& track, bool organized, bool& present) {
    return TargetPathFor(track, u".mp3", out_, organized, *files_, present);
  }

  void Put(const std::u16string& path, std::size_t size) {
    test::WriteBytes(PathFromText(path), std::vector<unsigned char>(size, 7));
  }

  test::TempFolder folder_;
  std::u16string out_ = TextFromPath(folder_ / "out");
  std::unique_ptr<platform::Files> files_ = platform::MakeSystemFiles();
};

TEST_F(TargetPathTest, BuildsTheOrganizedPathAndCreatesItsFolders) {
  bool present = false;
  const std::u16string target = Target(MakeTrack(u"Song.MP3", 10), true, present);
  EXPECT_EQ(target, out_ + kSep + u"Artist" + kSep + u"Album" + kSep + u"Song.mp3");
  EXPECT_TRUE(std::filesystem::is_directory(folder_ / "out" / "Artist" / "Album"));
  EXPECT_FALSE(present);
  EXPECT_EQ(Target(MakeTrack(u"Song", 10), false, present), out_ + kSep + u"Song.mp3");
}

TEST_F(TargetPathTest, NumbersClashesAndRecognisesAnEarlierCopyBySize) {
  bool present = false;
  const std::u16string first = out_ + kSep + u"Song.mp3";
  Put(first, 10);
  EXPECT_EQ(Target(MakeTrack(u"Song", 10), false, present), first);
  EXPECT_TRUE(present);

  present = false;
  EXPECT_EQ(Target(MakeTrack(u"Song", 11), false, present), out_ + kSep + u"Song[0].mp3");
  EXPECT_FALSE(present);
  Put(out_ + kSep + u"Song[0].mp3", 11);
  EXPECT_EQ(Target(MakeTrack(u"Song", 12), false, present), out_ + kSep + u"Song[1].mp3");
  // The numbered earlier copy is found too.
  EXPECT_EQ(Target(MakeTrack(u"Song", 11), false, present), out_ + kSep + u"Song[0].mp3");
  EXPECT_TRUE(present);
}

TEST_F(TargetPathTest, ASizeOfZeroAlwaysTakesTheNextFreeName) {
  bool present = false;
  Put(out_ + kSep + u"Song.mp3", 0);
  EXPECT_EQ(Target(MakeTrack(u"Song", 0), false, present), out_ + kSep + u"Song[0].mp3");
  EXPECT_FALSE(present);
}

TEST_F(TargetPathTest, AFolderAtTheNameIsNoCopy) {
  std::filesystem::create_directories(folder_ / "out" / "Song.mp3");
  bool present = false;
  // A folder's status size on Linux is 4096: it must still not count.
  EXPECT_EQ(Target(MakeTrack(u"Song", 4096), false, present), out_ + kSep + u"Song[0].mp3");
  EXPECT_FALSE(present);
}

TEST_F(TargetPathTest, DotNamesAndSeparatorsFromTheDatabaseStayInsideTheOutputFolder) {
  Track track = MakeTrack(u"..", 10);
  track.artist = u"..";
  track.album = u"..";
  bool present = false;
  const std::u16string target = Target(track, true, present);
  EXPECT_EQ(target, out_ + kSep + u"Unknown" + kSep + u"Unknown" + kSep + u"Unknown.mp3");

  track.artist = u"../../etc";
  track.album = u"a\\..\\..\\b";
  track.title = u"/../passwd";
  const std::filesystem::path escaped = PathFromText(Target(track, true, present));
  const std::filesystem::path out = PathFromText(out_);
  const std::filesystem::path relative = escaped.lexically_normal().lexically_relative(out);
  ASSERT_FALSE(relative.empty());
  EXPECT_NE(*relative.begin(), "..");
  EXPECT_EQ(std::distance(relative.begin(), relative.end()), 3);
}

}  // namespace
}  // namespace kestrune
