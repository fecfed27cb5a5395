#include "quorl-syncd/transfer/Device.h"

#include <limits>

#include <gtest/gtest.h>

#include "tests/engine/Folders.h"

namespace {

using namespace quorl::syncd;
using namespace quorl::syncd::testing;

TEST(Device, TakesAFileForAnotherWhoseTimeIsAsFarFromThatOfTheManifestAsTimesCanBe) {
    Player player;
    const Device device{player.wearable()};
    player.write("Music/one.mp3", "one");

    for (const auto time :
         {std::numeric_limits<std::int64_t>::min(), std::numeric_limits<std::int64_t>::max()}) {
        EXPECT_FALSE(device.isOurs({"one.mp3", "one.mp3", 3, time, ""}));
    }
}

} // namespace
