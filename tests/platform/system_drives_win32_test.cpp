#include <gtest/gtest.h>

#include <vector>

#include "platform/system.h"

namespace kestrune::platform {
namespace {

// The system's list holds at least C: (Wine maps it to its prefix); each entry has its root form.
TEST(SystemDrives, ListsTheSystemsDriveRoots) {
  const auto drives = MakeSystemDrives();
  const std::u16string list = drives->LogicalDriveStrings();
  ASSERT_GE(list.size(), 5u);
  EXPECT_EQ(list.back(), u'\0');
  EXPECT_NE(list.find(std::u16string(u"C:\\") + u'\0'), std::u16string::npos);
  EXPECT_EQ(drives->DriveType(u"C:"), kDriveFixed);
}

TEST(SystemDrives, ListsChosenFoldersFirstAsRemovable) {
  const auto drives = MakeSystemDrives({L"C:\\device"});
  EXPECT_EQ(drives->LogicalDriveStrings().substr(0, 11), std::u16string(u"C:\\device\\") + u'\0');
  EXPECT_EQ(drives->DriveType(u"C:\\device"), kDriveRemovable);
}

}  // namespace
}  // namespace kestrune::platform
