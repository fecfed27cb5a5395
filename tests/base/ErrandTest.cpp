// Threads that a device may keep for ever.

#include "services/base/Errand.h"

#include <atomic>
#include <csignal>
#include <semaphore>

#include <gtest/gtest.h>
#include <unistd.h>

namespace {

using quorl::base::endOfProgram;
using quorl::base::Errand;

constexpr std::chrono::hours forever{1};
constexpr std::chrono::milliseconds none{0};

TEST(Errand, IsStoppedAndWaitedForWhereItEnds) {
    std::atomic<bool> isAtEnd = false;
    {
        const Errand errand(
            [&isAtEnd](const std::stop_token& stop) {
                std::binary_semaphore stopped(0);
                const std::stop_callback wake(stop, [&stopped] { stopped.release(); });
                stopped.acquire();
                isAtEnd = true;
            },
            forever);
    }
    EXPECT_TRUE(isAtEnd);
}

TEST(Errand, GivesUpWhatItOwnsBeforeItsEndIsTold) {
    auto owned = std::make_shared<int>();
    const std::weak_ptr<int> seen = owned;
    {
        const Errand errand([owned = std::move(owned)](const std::stop_token&) {}, forever);
    }
    EXPECT_TRUE(seen.expired());
}

/// In a process of its own, which is at its end with a thread that never will be.
[[noreturn]] void endWithAThreadThatHangs() {
    const auto atExit = [] { _exit(1); };
    std::atexit(atExit);
    {
        const Errand errand([](const std::stop_token&) { pause(); }, none);
    }
    static_cast<void>(endOfProgram(7));
    _exit(2);
}

TEST(AThreadThatHangs, IsLeftBehindAndKeepsNoProcess) {
    EXPECT_EXIT(endWithAThreadThatHangs(), testing::ExitedWithCode(7), "");
}

TEST(AProgramWithoutSuchAThread, EndsAsEver) { EXPECT_EQ(endOfProgram(7), 7); }

} // namespace
