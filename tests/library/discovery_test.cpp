#include "library/discovery.h"

#include <gtest/gtest.h>

#include "platform/folder_drives.h"
#include "support/devices.h"
#include "support/temp_folder.h"

namespace kestrune {
namespace {

using platform::FolderDrives;
using platform::kDriveFixed;
using platform::kDriveRemovable;

// Drives as the system would list them, remembering which types were asked for.
class RecordingDrives : public FolderDrives {
 public:
  using FolderDrives::FolderDrives;
  unsigned DriveType(std::u16string_view drive) const override {
    asked.emplace_back(drive);
    return FolderDrives::DriveType(drive);
  }
  mutable std::vector<std::u16string> asked;
};

TEST(ListRemovableDrives, KeepsRemovableDrivesOtherThanFloppies) {
  RecordingDrives drives({{u"A:", kDriveRemovable},
                          {u"b:", kDriveRemovable},
                          {u"C:", kDriveFixed},
                          {u"e:", kDriveRemovable},
                          {u"F:", 5},
                          {u"G:", kDriveRemovable}});
  std::vector<std::u16string> list{u"kept"};
  ListRemovableDrives(drives, list);
  EXPECT_EQ(list, (std::vector<std::u16string>{u"kept", u"E:", u"G:"}));
  // Types are asked with the upper-cased drive string, without its separator.
  EXPECT_EQ(drives.asked, (std::vector<std::u16string>{u"A:", u"B:", u"C:", u"E:", u"F:", u"G:"}));
}

TEST(ListRemovableDrives, KeepsTheLetterCaseOfFolderNames) {
  FolderDrives drives({{u"/media/user/iPod", kDriveRemovable}});
  std::vector<std::u16string> list;
  ListRemovableDrives(drives, list);
  EXPECT_EQ(list, (std::vector<std::u16string>{u"/media/user/iPod"}));
}

TEST(ListRemovableDrives, AnEmptyListGivesNothing) {
  std::vector<std::u16string> list;
  ListRemovableDrives(FolderDrives(), list);
  EXPECT_TRUE(list.empty());
}

class FindDeviceTest : public ::testing::Test {
 protected:
  std::filesystem::path Device(const char* name, const char16_t* deviceName) {
    mkipod::DeviceDescription device;
    device.deviceName = deviceName;
    device.tracks = {test::SimpleTrack(1, u"a")};
    mkipod::WriteDevice(device, folder_ / name);
    return folder_ / name;
  }

  std::filesystem::path Malformed(const char* name) {
    const std::filesystem::path device = Device(name, u"broken");
    auto bytes = test::ReadBytes(device / "iPod_Control" / "iTunes" / "iTunesDB");
    bytes.resize(bytes.size() - 10);
    test::WriteBytes(device / "iPod_Control" / "iTunes" / "iTunesDB", bytes);
    return device;
  }

  test::TempFolder folder_;
};

TEST_F(FindDeviceTest, TheFirstDriveThatLoadsWins) {
  FolderDrives drives;
  drives.AddFolder(folder_ / "empty");
  drives.AddFolder(Device("first", u"First"), kDriveFixed);
  drives.AddFolder(Device("second", u"Second"));
  drives.AddFolder(Malformed("third"));  // never opened: the search ended before it
  const auto library = FindDevice(drives);
  ASSERT_TRUE(library.has_value());
  EXPECT_EQ(library->deviceName(), u"Second");
  EXPECT_EQ(library->tracks().size(), 1u);
}

TEST_F(FindDeviceTest, AMalformedDatabaseEndsTheSearch) {
  FolderDrives drives;
  drives.AddFolder(Malformed("broken"));
  drives.AddFolder(Device("good", u"Good"));
  std::string failure;
  EXPECT_FALSE(FindDevice(drives, &failure).has_value());
  EXPECT_NE(failure.find("broken"), std::string::npos);
}

TEST_F(FindDeviceTest, NoCandidateMeansNoDevice) {
  FolderDrives drives;
  drives.AddFolder(folder_ / "nothing here");
  EXPECT_FALSE(FindDevice(drives).has_value());
  EXPECT_FALSE(FindDevice(FolderDrives()).has_value());
}

}  // namespace
}  // namespace kestrune
