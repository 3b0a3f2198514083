#include "platform/folder_drives.h"

#include <gtest/gtest.h>

#include "base/paths.h"

namespace kestrune::platform {
namespace {

TEST(FolderDrives, ListsRootsInTheSystemsForm) {
  FolderDrives drives({{u"C:", kDriveFixed}, {u"e:", kDriveRemovable}});
  const std::u16string separator(1, kPathSeparator);
  EXPECT_EQ(drives.LogicalDriveStrings(),
            u"C:" + separator + u'\0' + u"e:" + separator + u'\0' + u'\0');
  EXPECT_EQ(FolderDrives().LogicalDriveStrings(), std::u16string(1, u'\0'));
}

TEST(FolderDrives, AnswersTypesByRootAndDriveLettersInAnyCase) {
  FolderDrives drives({{u"e:", kDriveRemovable}, {u"/media/ipod", kDriveRemovable}});
  EXPECT_EQ(drives.DriveType(u"E:"), kDriveRemovable);
  EXPECT_EQ(drives.DriveType(u"/media/ipod"), kDriveRemovable);
  EXPECT_EQ(drives.DriveType(u"/media/IPOD"), kDriveNoRootDir);
  EXPECT_EQ(drives.DriveType(u"F:"), kDriveNoRootDir);
}

TEST(FolderDrives, DropsTrailingSeparatorsOfFolders) {
  FolderDrives drives;
  drives.AddFolder(PathFromText(u"device//"));
  ASSERT_EQ(drives.entries().size(), 1u);
  EXPECT_EQ(drives.entries()[0].root, u"device");
}

}  // namespace
}  // namespace kestrune::platform
