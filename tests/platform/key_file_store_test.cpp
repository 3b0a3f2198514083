#include "platform/linux/key_file_store.h"

#include <gtest/gtest.h>
#include <sys/stat.h>

#include <fstream>

#include "platform/fake/memory_settings_store.h"
#include "support/temp_folder.h"

namespace kestrune::platform {
namespace {

std::string Text(const std::filesystem::path& path) {
  std::ifstream in(path, std::ios::binary);
  return std::string(std::istreambuf_iterator<char>(in), {});
}

class KeyFileStoreTest : public ::testing::Test {
 protected:
  test::TempFolder folder_;
  std::filesystem::path file_ = folder_ / "config" / "kestrune" / "settings.ini";
  KeyFileStore store_{file_};
};

TEST_F(KeyFileStoreTest, StoresStringsUnderTheRegistryKeyNames) {
  EXPECT_EQ(store_.OpenKey(RegistryRoot::kCurrentUser, u"Software\\Kestrune"), nullptr);
  auto key = store_.CreateKey(RegistryRoot::kCurrentUser, u"Software\\Kestrune");
  ASSERT_NE(key, nullptr);
  ASSERT_TRUE(key->SetString(u"OuputPath", u" /music\\x\tand\nmore \u00E9"));
  ASSERT_TRUE(key->SetString(u"Organized", u"false"));
  ASSERT_TRUE(key->SetString(u"organized", u"true"));  // one value, whatever the case
  EXPECT_EQ(Text(file_),
            "[HKEY_CURRENT_USER\\Software\\Kestrune]\n"
            "OuputPath=\\s/music\\\\x\\tand\\nmore \xC3\xA9\n"
            "Organized=true\n");

  auto reopened = KeyFileStore(file_).OpenKey(RegistryRoot::kCurrentUser, u"software\\kestrune");
  ASSERT_NE(reopened, nullptr);
  const auto value = reopened->QueryValue(u"OUPUTPATH");
  ASSERT_TRUE(value);
  EXPECT_EQ(value->type, kRegSz);
  EXPECT_EQ(value->data, StringValueBytes(u" /music\\x\tand\nmore \u00E9"));
  EXPECT_FALSE(reopened->QueryValue(u"AddToItunes"));
  EXPECT_EQ(store_.OpenKey(RegistryRoot::kLocalMachine, u"Software\\Kestrune"), nullptr);
}

TEST_F(KeyFileStoreTest, KeepsWhatItDoesNotKnowAndReplacesTheFileWhole) {
  std::filesystem::create_directories(file_.parent_path());
  std::ofstream(file_) << "# "
                          "kept\n[Other]\nx=1\n\n[HKEY_CURRENT_USER\\Software\\Kestrune]"
                          "\nAddToItunes=true\n\n[Last]\ny=2\n";
  struct stat before {};
  ASSERT_EQ(::stat(file_.c_str(), &before), 0);
  ASSERT_TRUE(store_.CreateKey(RegistryRoot::kCurrentUser, u"Software\\Kestrune")
                  ->SetString(u"OpenTarget", u"false"));
  EXPECT_EQ(Text(file_),
            "# kept\n[Other]\nx=1\n\n[HKEY_CURRENT_USER\\Software\\Kestrune]\nAddToItunes=true\n"
            "OpenTarget=false\n\n[Last]\ny=2\n");
  // A new file was renamed over the old one; no temporary file is left beside it.
  struct stat after {};
  ASSERT_EQ(::stat(file_.c_str(), &after), 0);
  EXPECT_NE(before.st_ino, after.st_ino);
  EXPECT_EQ(std::distance(std::filesystem::directory_iterator(file_.parent_path()), {}), 1);
}

TEST_F(KeyFileStoreTest, RefusesNamesTheFileCannotHoldAndFailsWhereItCannotWrite) {
  auto key = store_.CreateKey(RegistryRoot::kCurrentUser, u"Software\\Kestrune");
  EXPECT_FALSE(key->SetString(u"a=b", u"x"));
  EXPECT_FALSE(key->SetString(u"", u"x"));
  // A file where the settings folder should be.
  test::WriteBytes(folder_ / "blocked", {1});
  KeyFileStore blocked(folder_ / "blocked" / "settings.ini");
  EXPECT_EQ(blocked.CreateKey(RegistryRoot::kCurrentUser, u"Software\\Kestrune"), nullptr);
}

}  // namespace
}  // namespace kestrune::platform
