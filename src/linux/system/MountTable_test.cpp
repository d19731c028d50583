#include "linux/system/MountTable.h"

#include <gtest/gtest.h>

namespace vantrell::linuxos {
namespace {

constexpr std::string_view kTable =
    "22 1 254:1 / / rw,relatime shared:1 - ext4 /dev/vda1 rw\n"
    "30 22 0:30 / /home rw shared:2 master:3 - btrfs /dev/vdb rw,subvol=/home\n"
    "31 30 0:31 / /home/a\\040b rw - tmpfs none rw\n"
    "32 22 0:32 / /mnt rw - xfs /dev/vdc rw\n"
    "33 32 0:33 / /mnt rw - vfat /dev/vdd rw\n";

TEST(MountTable, TheDeepestMountPointAbovePathDecides) {
  EXPECT_EQ(fileSystemTypeInMountTable(kTable, "/var/lib"), "ext4");
  EXPECT_EQ(fileSystemTypeInMountTable(kTable, "/home/me/Documents"), "btrfs");
  EXPECT_EQ(fileSystemTypeInMountTable(kTable, "/home"), "btrfs");
}

TEST(MountTable, ASharedBeginningOfANameIsNoMountPoint) {
  EXPECT_EQ(fileSystemTypeInMountTable(kTable, "/homestead"), "ext4");
}

TEST(MountTable, EscapedBlanksInAMountPointAreRead) {
  EXPECT_EQ(fileSystemTypeInMountTable(kTable, "/home/a b/c"), "tmpfs");
}

TEST(MountTable, OfTwoMountsOnOnePointTheLaterOneIsSeen) {
  EXPECT_EQ(fileSystemTypeInMountTable(kTable, "/mnt/x"), "vfat");
}

TEST(MountTable, DamagedLinesArePassedOver) {
  EXPECT_EQ(fileSystemTypeInMountTable("\n \n1 2 3\n5 - x\n", "/a"), "");
  EXPECT_EQ(fileSystemTypeInMountTable("1 2 3 4 /\\04 rw - ext4 a b", "/\\04"), "ext4");
}

TEST(MountTable, ThisProcessKnowsTheTypeOfItsProcFolder) {
  EXPECT_EQ(fileSystemTypeOfPath("/proc/self"), "proc");
}

}  // namespace
}  // namespace vantrell::linuxos
