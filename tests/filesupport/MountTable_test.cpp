#include <gtest/gtest.h>

#include "filesupport/MountTable.h"

namespace {

using namespace kelcore::filesupport::detail;

// Lines in the format of proc(5), the first one its own example.
const char kMountInfo[] =
    "36 35 98:0 /mnt1 /mnt2 rw,noatime master:1 - ext3 /dev/root rw,errors=continue\n"
    "22 27 0:21 / / ro,relatime - ext4 /dev/sda1 rw\n"
    "40 22 0:30 / /media/My\\040Disk rw shared:5 unbindable - vfat /dev/sdb1 rw\n"
    "41 22 0:31 / /odd\\134name\\011x rw - tmpfs tmp\\040fs rw\n"
    "42 22 0:32 / /broken rw ext4\n"
    "\n"
    "43 22 0:33 / relative rw - tmpfs none rw\n"
    "44 22 0:34 / /media/My\\040Disk rw - fuse.sshfs host:/export rw";

TEST(MountTable, ParsesFieldsAndDecodesEscapes) {
  const std::vector<MountEntry> table = ParseMountInfo(kMountInfo);
  ASSERT_EQ(table.size(), 5u);
  EXPECT_EQ(table[0].root, "/mnt1");
  EXPECT_EQ(table[0].mountPoint, "/mnt2");
  EXPECT_EQ(table[0].fileSystemType, "ext3");
  EXPECT_EQ(table[0].source, "/dev/root");
  EXPECT_FALSE(table[0].readOnly);
  EXPECT_EQ(table[1].mountPoint, "/");
  EXPECT_TRUE(table[1].readOnly);
  EXPECT_EQ(table[2].mountPoint, "/media/My Disk");  // two optional fields skipped
  EXPECT_EQ(table[2].fileSystemType, "vfat");
  EXPECT_EQ(table[3].mountPoint, "/odd\\name\tx");
  EXPECT_EQ(table[3].source, "tmp fs");
  EXPECT_EQ(table[4].fileSystemType, "fuse.sshfs");  // no trailing newline
}

TEST(MountTable, DecodesOnlyByteEscapes) {
  EXPECT_EQ(DecodeMountField("a\\040b"), "a b");
  EXPECT_EQ(DecodeMountField("\\400"), "\\400");
  EXPECT_EQ(DecodeMountField("\\04"), "\\04");
  EXPECT_EQ(DecodeMountField("x\\"), "x\\");
  EXPECT_EQ(DecodeMountField("\\\\040"), "\\ ");
}

TEST(MountTable, FindsTheClosestMountOnAComponentBoundary) {
  const std::vector<MountEntry> table = ParseMountInfo(kMountInfo);
  EXPECT_EQ(FindContainingMount(table, "/media/My Disk/song.mp3"), 4u);  // mounted on top
  EXPECT_EQ(FindContainingMount(table, "/media/My Disk"), 4u);
  EXPECT_EQ(FindContainingMount(table, "/media/My Diskette"), 1u);
  EXPECT_EQ(FindContainingMount(table, "/mnt2x/a"), 1u);
  EXPECT_EQ(FindContainingMount(table, "/mnt2/a"), 0u);
  EXPECT_FALSE(FindContainingMount(std::vector<MountEntry>(), "/a"));
}

TEST(MountTable, ReadsTheTableOfThisProcess) {
  const std::vector<MountEntry> table = ReadMountTable();
  ASSERT_FALSE(table.empty());
  EXPECT_TRUE(FindContainingMount(table, "/").has_value());
}

}  // namespace
