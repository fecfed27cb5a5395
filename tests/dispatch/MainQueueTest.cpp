// Proves the libdispatch that was found: a host with its own event loop can drain the main queue.

#include <array>
#include <cstdint>
#include <thread>

#include <dispatch/dispatch.h>
#include <gtest/gtest.h>
#include <poll.h>
#include <unistd.h>

// Exported for hosts with an event loop of their own, but declared in no installed header.
extern "C" {
int _dispatch_get_main_queue_handle_4CF();
void _dispatch_main_queue_callback_4CF(void* message);
}

namespace {

constexpr int kPosters = 4;
constexpr int kPostsPerThread = 250'000;

/// What arrived on the main queue. Main thread only, which is what the test proves.
struct Arrivals {
    std::thread::id mainThread = std::this_thread::get_id();
    int onMainThread = 0;
    int elsewhere = 0;

    [[nodiscard]] int all() const { return onMainThread + elsewhere; }

    static void count(void* context) {
        auto& arrivals = *static_cast<Arrivals*>(context);
        ++(std::this_thread::get_id() == arrivals.mainThread ? arrivals.onMainThread
                                                             : arrivals.elsewhere);
    }
};

/// Waits until the main queue has work, then does it.
void drainOnce(int handle) {
    pollfd readable{.fd = handle, .events = POLLIN, .revents = 0};
    ASSERT_EQ(poll(&readable, 1, -1), 1);
    std::uint64_t wakeUps = 0;
    ASSERT_EQ(read(handle, &wakeUps, sizeof wakeUps), ssize_t{sizeof wakeUps});
    _dispatch_main_queue_callback_4CF(nullptr);
}

TEST(MainQueue, RunsAllThatFourThreadsPostOnTheMainThreadOnceEach) {
    Arrivals arrivals;
    const int handle = _dispatch_get_main_queue_handle_4CF();

    std::array<std::jthread, kPosters> posters;
    for (auto& poster : posters) {
        poster = std::jthread([&arrivals] {
            for (int i = 0; i < kPostsPerThread; ++i) {
                dispatch_async_f(dispatch_get_main_queue(), &arrivals, Arrivals::count);
            }
        });
    }
    while (arrivals.all() < kPosters * kPostsPerThread) {
        ASSERT_NO_FATAL_FAILURE(drainOnce(handle));
    }

    EXPECT_EQ(arrivals.onMainThread, kPosters * kPostsPerThread);
    EXPECT_EQ(arrivals.elsewhere, 0);
}

} // namespace
