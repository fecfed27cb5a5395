#include "services/engine/BusLoop.h"

#include <gtest/gtest.h>

namespace {

using namespace quorl;

/// A loop in which there is always a further message: each that comes is answered with another.
class AFlood : public ::testing::Test {
  protected:
    AFlood() {
        loop_.bus().addMatch(
            "type='signal',interface='org.example.Flood'",
            [this](sdbus::Message&) {
                ++messages_;
                send();
            },
            sdbus::floating_slot);
        for (int message = 0; message < 1000; ++message) {
            send();
        }
    }

    void send() { source_->emitSignal("Drop").onInterface("org.example.Flood"); }

    engine::BusLoop loop_{sdbus::createSessionBusConnection()};
    std::unique_ptr<sdbus::IObject> source_ = sdbus::createObject(loop_.bus(), "/flood");
    int messages_ = 0;
};

TEST_F(AFlood, OfMessagesKeepsNobodyFromWorkingNorFromLeaving) {
    int worked = 0;
    std::function<void()> work = [&] {
        // Only among messages does it count.
        if (messages_ > 0 && ++worked == 10) {
            loop_.stop();
        } else {
            loop_.post(work);
        }
    };
    loop_.post(work);

    EXPECT_EQ(loop_.run(), "");

    EXPECT_EQ(worked, 10);
}

} // namespace
