#include <gtest/gtest.h>

#include <chrono>
#include <cstdlib>
#include <fstream>
#include <thread>

#include "base/paths.h"
#include "platform/system.h"
#include "support/temp_folder.h"

namespace kestrune::platform {
namespace {

// Points HOME and XDG_CONFIG_HOME at a folder of the test for its lifetime.
class DesktopShellTest : public ::testing::Test {
 protected:
  void SetUp() override {
    Keep("HOME", home_);
    Keep("XDG_CONFIG_HOME", config_);
    setenv("HOME", folder_.path().c_str(), 1);
    setenv("XDG_CONFIG_HOME", (folder_ / "config").c_str(), 1);
  }
  void TearDown() override {
    Restore("HOME", home_);
    Restore("XDG_CONFIG_HOME", config_);
  }

  static void Keep(const char* name, std::optional<std::string>& value) {
    if (const char* set = std::getenv(name)) value = set;
  }
  static void Restore(const char* name, const std::optional<std::string>& value) {
    if (value)
      setenv(name, value->c_str(), 1);
    else
      unsetenv(name);
  }

  test::TempFolder folder_;
  std::optional<std::string> home_, config_;
  std::unique_ptr<Shell> shell_ = MakeSystemShell();
};

TEST_F(DesktopShellTest, FindsTheMusicFolderOfUserDirsElseTheUsualOne) {
  EXPECT_EQ(shell_->SpecialFolderPath(SpecialFolder::kMusic), TextFromPath(folder_ / "Music"));
  std::filesystem::create_directories(folder_ / "config");
  std::ofstream(folder_ / "config" / "user-dirs.dirs") << "# written by xdg-user-dirs-update\n"
                                                          "XDG_MUSIC_DIR=\"$HOME/Tunes\"\n";
  EXPECT_EQ(shell_->SpecialFolderPath(SpecialFolder::kMusic), TextFromPath(folder_ / "Tunes"));
  EXPECT_EQ(shell_->SpecialFolderPath(SpecialFolder::kProfile), TextFromPath(folder_.path()));
  EXPECT_FALSE(shell_->SpecialFolderPath(SpecialFolder::kProgramFiles).has_value());
  EXPECT_EQ(PathFromText(shell_->ProgramPath()).filename(), "platform_tests");
}

TEST_F(DesktopShellTest, RunsACommandLineWithoutWaitingForIt) {
  const std::filesystem::path made = folder_ / "made by the shell";
  shell_->Run(u"touch '" + TextFromPath(made) + u"'");
  for (int i = 0; i < 100 && !std::filesystem::exists(made); ++i) {
    std::this_thread::sleep_for(std::chrono::milliseconds(50));
  }
  EXPECT_TRUE(std::filesystem::exists(made));
}

}  // namespace
}  // namespace kestrune::platform
