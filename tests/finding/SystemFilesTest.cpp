// What the system's files tell of drives.

#include "services/finding/SystemFiles.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "tests/base/TemporaryDirectory.h"

namespace quorl::finding {

namespace {

using ::testing::UnorderedElementsAre;
using tests::TemporaryDirectory;

/// The files of a machine with a built-in disk, a stick and a memory card.
class Machine {
  public:
    Machine() {
        root_.write("proc/self/mountinfo", "90 27 8:17 / /media/STICK rw - vfat /dev/sdb1 rw\n");
        addDisk("pci0/ata1/block/sda", "8:0", "0");
        addDisk("pci0/usb2/2-1/block/sdb", "8:16", "0");
        addDisk("pci0/usb2/2-1/block/sdb/sdb1", "8:17", "0");
        addDisk("mmc_host/mmc1/mmc1:0001/block/mmcblk1", "179:0", "0");
        root_.write("sys/devices/mmc_host/mmc1/mmc1:0001/block/mmcblk1/device/type", "SD\n");
        addDisk("mmc_host/mmc1/mmc1:0001/block/mmcblk1/mmcblk1p1", "179:1", "0");
        addDisk("pci0/ata2/block/sr0", "11:0", "1");
        root_.makeDirectory("dev/disk/by-uuid");
        root_.makeDirectory("dev/disk/by-label");
        root_.link("dev/disk/by-uuid/1234-ABCD", "../../sdb1");
        root_.link("dev/disk/by-label/MY\\x20STICK\\x2f", "../../sdb1");
    }

    [[nodiscard]] Surroundings surroundings() const { return surroundingsIn(root_.path()); }

  private:
    void addDisk(const std::string& device, const std::string& number,
                 const std::string& removable) {
        const auto directory = "sys/devices/" + device;
        const auto name = std::filesystem::path(device).filename().string();
        root_.write(directory + "/dev", number + '\n');
        root_.write(directory + "/removable", removable + '\n');
        root_.makeDirectory("sys/class/block");
        root_.link("sys/class/block/" + name, "../../devices/" + device);
    }

    TemporaryDirectory root_;
};

TEST(SystemFiles, TellMountsAndDrivesByNumberNameAndUuid) {
    const auto now = Machine().surroundings();

    ASSERT_EQ(now.mounts.size(), 1U);
    const auto* const drive = driveOf(now.mounts[0], now.drives);
    ASSERT_NE(drive, nullptr);
    EXPECT_EQ(*drive, (Drive{.device = "8:17",
                             .node = "/dev/sdb1",
                             .uuid = "1234-ABCD",
                             .label = "MY STICK/",
                             .isPluggable = true,
                             .removal = {}}));
}

TEST(SystemFiles, TellWhatComesAndGoesFromWhatIsBuiltIn) {
    std::vector<std::string> pluggable;
    for (const auto& drive : Machine().surroundings().drives) {
        if (drive.isPluggable) {
            pluggable.push_back(drive.node);
        }
    }

    EXPECT_THAT(pluggable, UnorderedElementsAre("/dev/sdb", "/dev/sdb1", "/dev/mmcblk1",
                                                "/dev/mmcblk1p1", "/dev/sr0"));
}

TEST(SystemFiles, ThatAreNotThereTellNothing) {
    EXPECT_EQ(surroundingsIn("/nonexistent"), Surroundings());
}

TEST(Drives, OfFilesAreAddedToThoseOfTheService) {
    const Drive told{.device = "8:17", .label = "told"};
    const Drive seen{.device = "8:17", .label = "seen"};
    const Drive more{.device = "8:33"};

    EXPECT_THAT(joined({told}, {seen, more}), ::testing::ElementsAre(told, more));
}

} // namespace

} // namespace quorl::finding
