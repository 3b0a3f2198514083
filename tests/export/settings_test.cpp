#include "export/settings.h"

#include <gtest/gtest.h>

#include "base/paths.h"
#include "base/utf.h"
#include "platform/fake/fake_shell.h"
#include "platform/fake/memory_settings_store.h"

namespace kestrune {
namespace {

using platform::RegistryRoot;
using platform::RegistryValue;
using platform::StringValueBytes;

class SettingsTest : public ::testing::Test {
 protected:
  void Store(std::u16string_view name, RegistryValue value) {
    store_.SetValue(RegistryRoot::kCurrentUser, kSettingsKey, name, std::move(value));
  }
  std::u16string Read(std::u16string_view name) { return ReadSetting(store_, name, u"default"); }

  platform::MemorySettingsStore store_;
  platform::FakeShell shell_;
};

TEST_F(SettingsTest, ReadsStringsAndOnlyWellFormedOnes) {
  EXPECT_EQ(Read(u"Missing"), u"default");  // no key at all
  Store(u"Plain", {platform::kRegSz, StringValueBytes(u"text")});
  Store(u"Expand", {platform::kRegExpandSz, StringValueBytes(u"%HOME%\\x")});
  Store(u"Empty", {platform::kRegSz, StringValueBytes(u"")});
  Store(u"Inner", {platform::kRegSz, StringValueBytes(std::u16string(u"ab\0cd", 5))});
  EXPECT_EQ(Read(u"plain"), u"text");  // value names in any case
  EXPECT_EQ(Read(u"Expand"), u"%HOME%\\x");
  EXPECT_EQ(Read(u"Empty"), u"");
  EXPECT_EQ(Read(u"Inner"), u"ab");

  std::vector<unsigned char> unterminated = StringValueBytes(u"abc");
  unterminated.resize(unterminated.size() - 2);
  Store(u"NoTerminator", {platform::kRegSz, unterminated});
  std::vector<unsigned char> odd = StringValueBytes(u"abc");
  odd.push_back(0);
  Store(u"Odd", {platform::kRegSz, odd});
  Store(u"Dword", {platform::kRegDword, {1, 0, 0, 0}});
  Store(u"Nothing", {platform::kRegSz, {}});
  for (const char16_t* name : {u"NoTerminator", u"Odd", u"Dword", u"Nothing"}) {
    EXPECT_EQ(Read(name), u"default") << EncodeUtf8(name);
  }
}

TEST_F(SettingsTest, AFolderLongerThan259UnitsReadsBackWhole) {
  const std::u16string folder = u"C:\\" + std::u16string(400, u'f');
  WriteSetting(store_, kOutputPathValue, folder);
  EXPECT_EQ(Read(kOutputPathValue), folder);
}

TEST_F(SettingsTest, OptionsRoundTripAndOnlyExactTrueTicks) {
  ExportOptions options{false, true, false, u"D:\\Out"};
  SaveExportOptions(store_, options);
  const auto stored = store_.Value(RegistryRoot::kCurrentUser, kSettingsKey, u"AddToItunes");
  ASSERT_TRUE(stored);
  EXPECT_EQ(stored->type, platform::kRegSz);
  EXPECT_EQ(stored->data, StringValueBytes(u"false"));  // (length + 1) × 2 bytes
  ExportOptions loaded = LoadExportOptions(store_, shell_);
  EXPECT_FALSE(loaded.addToItunes);
  EXPECT_TRUE(loaded.openTarget);
  EXPECT_FALSE(loaded.organized);
  EXPECT_EQ(loaded.outputPath, u"D:\\Out");

  WriteSetting(store_, kAddToItunesValue, u"True");
  WriteSetting(store_, kOpenTargetValue, u"1");
  WriteSetting(store_, kOrganizedValue, u"true ");
  loaded = LoadExportOptions(store_, shell_);
  EXPECT_FALSE(loaded.addToItunes);
  EXPECT_FALSE(loaded.openTarget);
  EXPECT_FALSE(loaded.organized);
}

TEST_F(SettingsTest, AnEmptyFieldKeepsTheStoredFolderAndAStoredEmptyFolderStaysEmpty) {
  SaveExportOptions(store_, {true, true, true, u"D:\\Kept"});
  SaveExportOptions(store_, {true, true, true, u""});
  EXPECT_EQ(LoadExportOptions(store_, shell_).outputPath, u"D:\\Kept");
  WriteSetting(store_, kOutputPathValue, u"");
  EXPECT_EQ(LoadExportOptions(store_, shell_).outputPath, u"");
}

TEST_F(SettingsTest, AFirstRunTicksEverythingAndProposesTheMusicFolder) {
  shell_.folders[platform::SpecialFolder::kMusic] = u"M";
  const ExportOptions options = LoadExportOptions(store_, shell_);
  EXPECT_TRUE(options.addToItunes && options.openTarget && options.organized);
  const std::u16string sep(1, kPathSeparator);
  EXPECT_EQ(options.outputPath, u"M" + sep + u"iTunes" + sep + u"iTunes Music");
  EXPECT_FALSE(store_.HasKey(RegistryRoot::kCurrentUser, kSettingsKey));  // reading creates nothing
}

TEST_F(SettingsTest, WithoutAMusicFolderTheProgramsDriveIsProposed) {
  shell_.programPath = u"d:\\Tools\\Kestrune.exe";
  EXPECT_EQ(DefaultOutputFolder(shell_), u"D:\\VizUveVuzod");
  shell_.programPath = u"/usr/bin/kestrune";
  shell_.folders[platform::SpecialFolder::kProfile] = u"/home/u";
  EXPECT_EQ(DefaultOutputFolder(shell_),
            u"/home/u" + std::u16string(1, kPathSeparator) + u"VizUveVuzod");
}

TEST_F(SettingsTest, WritingFailsSilentlyWhenTheKeyCannotBeMade) {
  store_.refuseCreate = true;
  WriteSetting(store_, kOrganizedValue, u"false");
  EXPECT_EQ(ReadSetting(store_, kOrganizedValue, u"true"), u"true");
}

}  // namespace
}  // namespace kestrune
