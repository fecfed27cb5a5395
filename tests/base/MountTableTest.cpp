// What the kernel says of what is mounted where.

#include "services/base/MountTable.h"

#include <gtest/gtest.h>

namespace quorl::base {

namespace {

constexpr auto table =
    R"(27 1 254:0 / / rw,relatime - ext4 /dev/vda rw,discard
28 27 0:21 / /proc rw,relatime shared:5 - proc proc rw
90 27 8:17 / /media/me/MY\040STICK rw,nosuid shared:70 master:3 - vfat /dev/sdb1 rw,uid=1000
91 27 8:33 /@music /media/me rw - btrfs /dev/sdc1 ro,subvol=/@music
no line of the table
)";

TEST(MountTable, TellsEachMountWithWhatIsEscapedInIt) {
    const auto mounts = mountsIn(table);

    ASSERT_EQ(mounts.size(), 4U);
    EXPECT_EQ(mounts[2], (Mount{.id = "90",
                                .device = "8:17",
                                .root = "/",
                                .directory = "/media/me/MY STICK",
                                .isReadOnly = false,
                                .type = "vfat",
                                .source = "/dev/sdb1"}));
    EXPECT_EQ(mounts[3].root, "/@music");
}

TEST(MountTable, ADeviceThatIsReadOnlyMakesItsMountsSo) {
    EXPECT_TRUE(mountsIn(table)[3].isReadOnly);
    EXPECT_FALSE(mountsIn(table)[0].isReadOnly);
}

TEST(MountTable, AFileIsOnTheMountThatIsClosestToIt) {
    const auto mounts = mountsIn(table);

    EXPECT_EQ(mountOver("/media/me/MY STICK/Music", mounts)->device, "8:17");
    EXPECT_EQ(mountOver("/media/me/MY STICKER", mounts)->device, "8:33");
    EXPECT_EQ(mountOver("/home", mounts)->device, "254:0");
    EXPECT_EQ(mountOver("/home", {}), nullptr);
}

TEST(MountTable, OfTwoAtOneDirectoryTheLaterOneIsSeen) {
    auto mounts = mountsIn(table);
    mounts.push_back(mounts[2]);
    mounts.back().device = "8:49";

    EXPECT_EQ(mountOver("/media/me/MY STICK", mounts)->device, "8:49");
}

} // namespace

} // namespace quorl::base
