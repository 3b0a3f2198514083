#include <gtest/gtest.h>

#include "platform/system.h"
#include "support/temp_folder.h"
#ifndef _WIN32
#include "support/file_size_limit.h"
#endif

namespace kestrune::platform {
namespace {

class SystemFilesTest : public ::testing::Test {
 protected:
  std::vector<std::string> Entries(const std::filesystem::path& folder) {
    std::vector<std::string> names;
    for (const auto& entry : std::filesystem::directory_iterator(folder))
      names.push_back(entry.path().filename().string());
    std::sort(names.begin(), names.end());
    return names;
  }

  test::TempFolder folder_;
  std::unique_ptr<Files> files_ = MakeSystemFiles();
};

TEST_F(SystemFilesTest, CopiesExactBytesAndReplacesAnOlderFile) {
  std::vector<unsigned char> bytes(3 << 20);
  for (std::size_t i = 0; i < bytes.size(); ++i)
    bytes[i] = static_cast<unsigned char>(i * 7 + i / 4096);
  test::WriteBytes(folder_ / "source.bin", bytes);
  ASSERT_TRUE(files_->CreateFolderPath(folder_ / "a" / "b" / "c"));
  const auto target = folder_ / "a" / "b" / "c" / "copy.bin";
  test::WriteBytes(target, {1, 2, 3});
  ASSERT_FALSE(files_->CopyFileReplacing(folder_ / "source.bin", target));
  EXPECT_EQ(test::ReadBytes(target), bytes);
  EXPECT_EQ(files_->FileSizeOf(target), bytes.size());
  EXPECT_EQ(Entries(target.parent_path()), std::vector<std::string>{"copy.bin"});
}

TEST_F(SystemFilesTest, TellsFilesFromFoldersAndMissingPaths) {
  std::filesystem::create_directory(folder_ / "folder");
  EXPECT_TRUE(files_->FileExists(folder_ / "folder"));
  EXPECT_EQ(files_->FileSizeOf(folder_ / "folder"), 0u);
  EXPECT_FALSE(files_->FileExists(folder_ / "missing"));
  EXPECT_EQ(files_->FileSizeOf(folder_ / "missing"), 0u);
}

TEST_F(SystemFilesTest, AFailedCopyLeavesNothingBehind) {
  test::WriteBytes(folder_ / "source.bin", {1, 2, 3});
  std::filesystem::create_directory(folder_ / "out");
  // A folder standing at the target refuses the rename.
  std::filesystem::create_directory(folder_ / "out" / "taken");
  EXPECT_TRUE(files_->CopyFileReplacing(folder_ / "source.bin", folder_ / "out" / "taken"));
  EXPECT_TRUE(files_->CopyFileReplacing(folder_ / "missing.bin", folder_ / "out" / "copy.bin"));
  EXPECT_EQ(Entries(folder_ / "out"), std::vector<std::string>{"taken"});
  // A file standing where a folder should be.
  EXPECT_FALSE(files_->CreateFolderPath(folder_ / "source.bin" / "sub"));
}

TEST_F(SystemFilesTest, MakesAReadOnlyCopyWritable) {
  test::WriteBytes(folder_ / "locked.bin", {1});
  std::filesystem::permissions(folder_ / "locked.bin", std::filesystem::perms::owner_read);
  files_->SetNormalAttributes(folder_ / "locked.bin");
  const auto perms = std::filesystem::status(folder_ / "locked.bin").permissions();
  EXPECT_NE(perms & std::filesystem::perms::owner_write, std::filesystem::perms::none);
}

#ifndef _WIN32
TEST_F(SystemFilesTest, ADiskThatFillsUpHalfWayLeavesNoPartialFile) {
  test::WriteBytes(folder_ / "big.bin", std::vector<unsigned char>(1 << 20, 9));
  std::filesystem::create_directory(folder_ / "out");
  std::error_code error;
  {
    test::FileSizeLimit full(256 << 10);
    error = files_->CopyFileReplacing(folder_ / "big.bin", folder_ / "out" / "big.bin");
  }
  EXPECT_EQ(error, std::errc::file_too_large);
  EXPECT_TRUE(Entries(folder_ / "out").empty());
}
#endif

}  // namespace
}  // namespace kestrune::platform
