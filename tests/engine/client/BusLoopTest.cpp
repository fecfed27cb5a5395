#include "services/engine/BusLoop.h"

#include <algorithm>

#include <gtest/gtest.h>

namespace {

using namespace quorl;

/// A loop that many messages are waiting for.
class AFlood : public ::testing::Test {
  protected:
    static constexpr int all = 1000;

    AFlood() {
        loop_.bus().addMatch(
            "type='signal',interface='org.example.Flood'", [this](sdbus::Message&) { ++messages_; },
            sdbus::floating_slot);
        for (int message = 0; message < all; ++message) {
            source_->emitSignal("Drop").onInterface("org.example.Flood");
        }
    }

    engine::BusLoop loop_{sdbus::createSessionBusConnection()};
    std::unique_ptr<sdbus::IObject> source_ = sdbus::createObject(loop_.bus(), "/flood");
    int messages_ = 0;
};

TEST_F(AFlood, OfMessagesLetsWorkThroughAfterEachOfThem) {
    int before = 0;
    int mostInBetween = 0;
    std::function<void()> work = [&] {
        mostInBetween = std::max(mostInBetween, messages_ - std::exchange(before, messages_));
        if (messages_ < all) {
            loop_.post(work);
        } else {
            loop_.stop();
        }
    };
    loop_.post(work);

    EXPECT_EQ(loop_.run(), "");

    EXPECT_EQ(mostInBetween, 1);
}

} // namespace
