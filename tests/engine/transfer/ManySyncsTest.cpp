// What syncs use beside the wearable: nothing of it is left behind, and little is held at a time.

#include <fstream>
#include <iostream>

#include <gtest/gtest.h>
#include <sys/resource.h>

#include "tests/engine/Folders.h"
#include "tests/engine/transfer/ObservedVolume.h"

namespace {

using namespace quorl::syncd;
using namespace quorl::syncd::testing;
using Kind = Outcome::Kind;

/// Set for a long run.
std::size_t syncs() {
    constexpr std::size_t few = 300;
    const auto* const number = std::getenv("QUORL_SYNCS");
    return number == nullptr ? few : std::stoul(number);
}

std::size_t descriptors() {
    using Entries = std::filesystem::directory_iterator;
    return static_cast<std::size_t>(std::distance(Entries("/proc/self/fd"), Entries()));
}

std::size_t threads() {
    using Entries = std::filesystem::directory_iterator;
    return static_cast<std::size_t>(std::distance(Entries("/proc/self/task"), Entries()));
}

/// Its own, in KiB: what it shares with others is divided among them, who come and go.
std::size_t memory() {
    std::ifstream stream("/proc/self/smaps_rollup");
    for (std::string word; stream >> word;) {
        if (word == "Anonymous:") {
            std::size_t kibibytes = 0;
            stream >> kibibytes;
            return kibibytes;
        }
    }
    throw std::runtime_error("no memory is told of");
}

/// Without waiting for the disk.
Outcome quickSync(const Order& order) {
    return sync(order, {}, {}, [](const auto& wearable) {
        return std::make_unique<ObservedVolume>(openPosixVolume(wearable), [](const Step&) {});
    });
}

/// At most so many descriptors as long as it is there.
class DescriptorLimit {
  public:
    explicit DescriptorLimit(rlim_t most) {
        getrlimit(RLIMIT_NOFILE, &before_);
        const rlimit limit{most, before_.rlim_max};
        setrlimit(RLIMIT_NOFILE, &limit);
    }

    ~DescriptorLimit() { setrlimit(RLIMIT_NOFILE, &before_); }

    DescriptorLimit(const DescriptorLimit&) = delete;
    DescriptorLimit& operator=(const DescriptorLimit&) = delete;

  private:
    rlimit before_{};
};

TEST(ManySyncs, LeaveNoDescriptorNoThreadAndNoMemoryBehind) {
    constexpr std::size_t warmUp = 50;
    Music music;
    const Player player;
    std::size_t descriptorsBefore = 0;
    std::size_t threadsBefore = 0;
    std::size_t memoryBefore = 0;
    for (std::size_t at = 0; at < warmUp + syncs(); ++at) {
        if (at == warmUp) {
            descriptorsBefore = descriptors();
            threadsBefore = threads();
            memoryBefore = memory();
        }
        music.write("one.mp3", "one " + std::to_string(at));
        music.write("two.mp3", "two");
        music.list(at % 2 == 0 ? std::vector<std::string>{"one.mp3", "two.mp3"}
                               : std::vector<std::string>{"two.mp3", "one.mp3"});
        ASSERT_EQ(quickSync(wishFor(music, player)).kind, Kind::Sent);
    }

    EXPECT_EQ(descriptors(), descriptorsBefore);
    EXPECT_EQ(threads(), threadsBefore);
    // A sanitizer keeps what was freed for some time.
    const auto memoryAfter = memory();
    RecordProperty("memoryBefore", std::to_string(memoryBefore));
    RecordProperty("memoryAfter", std::to_string(memoryAfter));
    std::cout << syncs() << " syncs: " << memoryBefore << " KiB before, " << memoryAfter
              << " KiB after\n";
#ifndef __SANITIZE_ADDRESS__
    constexpr std::size_t slack = 1024;
    EXPECT_LE(memoryAfter, memoryBefore + slack);
#endif
}

TEST(ManySyncs, CopyManySongsUnderALimitOf64Descriptors) {
    constexpr int songs = 200;
    Music music;
    const Player player;
    std::vector<std::string> names;
    for (int song = 0; song < songs; ++song) {
        names.push_back(std::to_string(song) + ".mp3");
        music.write(names.back(), names.back());
    }
    music.list(names);
    const auto order = wishFor(music, player);
    const DescriptorLimit limit(64);

    const auto outcome = quickSync(order);

    EXPECT_EQ(outcome.kind, Kind::Sent) << quorl::engine::sentence(outcome.message);
    EXPECT_EQ(player.music().size(), songs + 1);
}

} // namespace
