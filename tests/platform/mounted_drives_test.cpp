#include "platform/linux/mounted_drives.h"

#include <gtest/gtest.h>

#include <fstream>

#include "support/temp_folder.h"

namespace kestrune::platform {
namespace {

namespace fs = std::filesystem;

// A mount table and a /sys/class/block tree as the kernel presents them.
class MountedDrivesTest : public ::testing::Test {
 protected:
  void SetUp() override {
    std::ofstream(folder_ / "mounts") << "/dev/sda1 / ext4 rw 0 0\n"
                                         "proc /proc proc rw 0 0\n"
                                         "/dev/sdb1 /mnt/ipod\\040classic vfat rw 0 0\n"
                                         "/dev/sdc1 /media/user/STICK vfat rw 0 0\n"
                                         "tmpfs /run/media/user/RAM tmpfs rw 0 0\n"
                                         "/dev/sda2 /home ext4 rw 0 0\n"
                                         "garbage\n";
    Disk("sda", '0', {"sda1", "sda2"});
    Disk("sdb", '1', {"sdb1"});
  }

  void Disk(const std::string& disk, char removable, const std::vector<std::string>& partitions) {
    const fs::path device = folder_ / "devices" / disk;
    fs::create_directories(device);
    std::ofstream(device / "removable") << removable << '\n';
    fs::create_directories(folder_ / "class");
    for (const std::string& partition : partitions) {
      fs::create_directories(device / partition);
      std::ofstream(device / partition / "partition") << "1\n";
      fs::create_directory_symlink(device / partition, folder_ / "class" / partition);
    }
  }

  MountedDrives Drives(FolderDrives first = {}) {
    return MountedDrives(folder_ / "mounts", folder_ / "class", std::move(first));
  }

  test::TempFolder folder_;
};

TEST_F(MountedDrivesTest, ListsBlockDeviceMountsAndDesktopMediaMounts) {
  const std::u16string expected = std::u16string(u"/") + u"/" + u'\0' + u"/mnt/ipod classic/" +
                                  u'\0' + u"/media/user/STICK/" + u'\0' + u"/run/media/user/RAM/" +
                                  u'\0' + u"/home/" + u'\0' + u'\0';
  EXPECT_EQ(Drives().LogicalDriveStrings(), expected);
}

TEST_F(MountedDrivesTest, TypesFollowTheKernelFlagAndTheMountFolder) {
  MountedDrives drives = Drives();
  EXPECT_EQ(drives.DriveType(u"/"), kDriveFixed);
  EXPECT_EQ(drives.DriveType(u"/home"), kDriveFixed);
  EXPECT_EQ(drives.DriveType(u"/mnt/ipod classic"), kDriveRemovable);  // flagged by the kernel
  EXPECT_EQ(drives.DriveType(u"/media/user/STICK"), kDriveRemovable);  // mounted by the desktop
  EXPECT_EQ(drives.DriveType(u"/run/media/user/RAM"), kDriveRemovable);
  EXPECT_EQ(drives.DriveType(u"/proc"), kDriveNoRootDir);
}

TEST_F(MountedDrivesTest, ListsChosenFoldersFirst) {
  FolderDrives first;
  first.Add(u"/tmp/device");
  MountedDrives drives = Drives(std::move(first));
  EXPECT_EQ(drives.LogicalDriveStrings().substr(0, 13), std::u16string(u"/tmp/device/") + u'\0');
  EXPECT_EQ(drives.DriveType(u"/tmp/device"), kDriveRemovable);
}

TEST(UnescapeMountField, UndoesOctalEscapesOnly) {
  EXPECT_EQ(UnescapeMountField("/media/My\\040iPod"), "/media/My iPod");
  EXPECT_EQ(UnescapeMountField("tab\\011back\\134slash"), "tab\tback\\slash");
  EXPECT_EQ(UnescapeMountField("odd\\9x\\04"), "odd\\9x\\04");
}

}  // namespace
}  // namespace kestrune::platform
