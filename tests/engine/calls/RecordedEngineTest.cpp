// The real engine's system calls keep the same rules as the simulated wearable's steps.

#include <csignal>

#include "tests/engine/EngineFixture.h"
#include "tests/engine/calls/SystemCalls.h"
#include "tests/engine/calls/VolumeRules.h"

namespace {

using namespace quorl::syncd::testing;
using quorl::engine::Event;

class RecordedEngine : public EngineTest {
  protected:
    void SetUp() override {
        if (Process({STRACE, "--quiet=all", "/bin/true"}).wait() != 0) {
            GTEST_SKIP() << "no program may be traced here";
        }
    }

    /// Starts the engine under a tracer.
    void startTraced() {
        auto command = tracer(log_.path() / "calls");
        command.insert(command.end(), {ENGINE_PROGRAM, "--music-folder", music_.path()});
        // The tracer holds the place that the search for leaks would want.
        engine_ = std::make_unique<Process>(
            command, std::map<std::string, std::string>{{"ASAN_OPTIONS", "detect_leaks=0"}});
        recorder_.next(Event::Kind::EngineDidAppear);
    }

    TemporaryDirectory log_;
};

TEST_F(RecordedEngine, KeepsTheRulesThroughAFirstSyncAChangedChoiceAndAnotherOrder) {
    for (const auto* name : {"one.mp3", "two.mp3", "three.mp3"}) {
        music_.write(name, name);
    }
    music_.list({"one.mp3", "two.mp3"});
    std::filesystem::create_directories(wearable_);
    startTraced();

    choose();
    ASSERT_TRUE(sessionEnd().success);
    music_.list({"two.mp3", "three.mp3"});
    ASSERT_TRUE(sessionEnd().success);
    music_.list({"three.mp3", "two.mp3"});
    ASSERT_TRUE(sessionEnd().success);
    end(SIGTERM);

    const auto steps = stepsIn(linesOf(log_.path() / "calls"), wearable_);
    EXPECT_EQ(firstBreach(steps), "");
    const auto renames = std::ranges::count(steps, "rename", &Step::operation);
    EXPECT_EQ(renames, 3 + 3) << "every song and every playlist was seen";
}

} // namespace
