// Which disks a loss of power is said to leave.

#include "tests/power/BlockLog.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

namespace {

using namespace quorl::power;
using testing::ElementsAre;

std::string entry(std::uint64_t offset, const std::string& bytes) {
    const std::uint64_t head[]{offset, bytes.size()};
    return std::string(reinterpret_cast<const char*>(head), sizeof head) + bytes;
}

std::string sectors(char letter, std::size_t count) {
    return std::string(count * sectorSize, letter);
}

/// One sector, two others, and a last one.
BlockLog log() {
    return parseBlockLog(entry(0, sectors('a', 1)) + entry(512, sectors('b', 2)) +
                         entry(0, sectors('c', 1)) + entry(512, "half an entry").substr(0, 20));
}

std::string diskAfter(const PowerCut& cut) {
    auto disk = sectors('-', 3);
    apply(log(), cut, disk);
    return {disk[0], disk[512], disk[1024]};
}

TEST(BlockLog, IsReadAsFarAsItIsWhole) {
    ASSERT_EQ(log().writes.size(), 3);
    EXPECT_EQ(log().writes[1].offset, 512);
    EXPECT_EQ(log().writes[1].bytes, sectors('b', 2));
}

TEST(BlockLog, IsCutAfterEachWriteAndWithinEach) {
    EXPECT_THAT(powerCuts(log()),
                ElementsAre(PowerCut{0}, PowerCut{1}, PowerCut{1, 1}, PowerCut{2}, PowerCut{3}));
}

TEST(BlockLog, LeavesWhatWasWrittenBeforeTheCut) {
    EXPECT_EQ(diskAfter({0}), "---");
    EXPECT_EQ(diskAfter({1, 1}), "ab-");
    EXPECT_EQ(diskAfter({3}), "cbb");
}

} // namespace
