#include "platform/Dispatch.h"

#include <atomic>
#include <latch>
#include <thread>

#include <gmock/gmock.h>

#include "tests/support/MainQueueRun.h"

namespace {

using quorl::tests::runMainQueuePast;
using quorl::tests::runMainQueueUntil;
using quorl::tests::runQueuedWork;
using std::chrono::milliseconds;
using testing::ElementsAre;
using testing::IsEmpty;

dispatch_time_t soon(milliseconds delay) {
    return dispatch_time(DISPATCH_TIME_NOW, std::chrono::nanoseconds(delay).count());
}

TEST(Once, RunsOneOfManyAndLetsAllWaitForIt) {
    static dispatch_once_t predicate;
    constexpr int callers = 8;
    std::atomic<int> runs = 0;
    std::atomic<int> tooEarly = 0;
    std::latch start(callers);

    {
        std::vector<std::jthread> threads;
        for (int caller = 0; caller < callers; ++caller) {
            threads.emplace_back([&] {
                start.arrive_and_wait();
                dispatch_once(&predicate, [&runs] {
                    std::this_thread::yield();
                    ++runs;
                });
                tooEarly += runs == 1 ? 0 : 1;
            });
        }
    }

    EXPECT_EQ(runs, 1);
    EXPECT_EQ(tooEarly, 0);
}

TEST(Once, RunsOncePerPredicate) {
    static dispatch_once_t first;
    static dispatch_once_t second;
    int runs = 0;

    for (auto* predicate : {&first, &second, &first, &second}) {
        dispatch_once(predicate, [&runs] { ++runs; });
    }

    EXPECT_EQ(runs, 2);
}

TEST(MainQueueWork, RunsLaterAndInOrderAlsoWhenQueuedOnTheMainThread) {
    std::vector<std::string> calls;

    dispatch_async(dispatch_get_main_queue(), [&calls] {
        calls.emplace_back("first");
        dispatch_async(dispatch_get_main_queue(), [&calls] { calls.emplace_back("third"); });
    });
    dispatch_async(dispatch_get_main_queue(), [&calls] { calls.emplace_back("second"); });
    EXPECT_THAT(calls, IsEmpty());

    runQueuedWork();
    EXPECT_THAT(calls, ElementsAre("first", "second", "third"));
}

TEST(MainQueueWork, RunsOnTheMainThreadWhoeverQueuedIt) {
    std::thread::id ran;

    std::jthread([&ran] {
        dispatch_async(dispatch_get_main_queue(), [&ran] { ran = std::this_thread::get_id(); });
    }).join();
    runQueuedWork();

    EXPECT_EQ(ran, std::this_thread::get_id());
}

TEST(MainQueueWork, IsLetGoOfRightAfterItHasRun) {
    auto captured = std::make_shared<int>(7);
    const std::weak_ptr<int> watched = captured;
    bool wasThere = false;
    bool isGoneForTheNext = false;

    dispatch_async(dispatch_get_main_queue(),
                   [captured = std::move(captured), &wasThere] { wasThere = *captured == 7; });
    dispatch_async(dispatch_get_main_queue(),
                   [watched, &isGoneForTheNext] { isGoneForTheNext = watched.expired(); });
    EXPECT_FALSE(watched.expired());
    runQueuedWork();

    EXPECT_TRUE(wasThere);
    EXPECT_TRUE(isGoneForTheNext);
}

TEST(MainQueueWork, MayOwnWhatCannotBeCopied) {
    int seen = 0;

    dispatch_async(dispatch_get_main_queue(),
                   [owned = std::make_unique<int>(7), &seen] { seen = *owned; });
    runQueuedWork();

    EXPECT_EQ(seen, 7);
}

TEST(MainQueueWork, ThatThrowsEndsTheProcess) {
    EXPECT_DEATH(
        {
            dispatch_async(dispatch_get_main_queue(), [] { throw std::runtime_error("lost"); });
            runQueuedWork();
        },
        "");
}

TEST(DelayedWork, RunsInTheOrderOfItsMoments) {
    std::vector<std::string> calls;
    const auto note = [&calls](const char* text) {
        return [&calls, text] { calls.emplace_back(text); };
    };

    dispatch_after(soon(milliseconds(400)), dispatch_get_main_queue(), note("late"));
    dispatch_after(soon(milliseconds(20)), dispatch_get_main_queue(), note("early"));
    runQueuedWork();
    EXPECT_THAT(calls, IsEmpty());

    runMainQueueUntil([&calls] { return calls.size() == 2; });
    EXPECT_THAT(calls, ElementsAre("early", "late"));
}

/// A one-shot timer on the main queue.
dispatch_source_ref makeTimer(std::function<void()> handler) {
    auto source = dispatch_take_source(
        dispatch_source_create(DISPATCH_SOURCE_TYPE_TIMER, 0, 0, dispatch_get_main_queue()));
    dispatch_source_set_event_handler(source.get(), std::move(handler));
    dispatch_resume(source.get());
    return source;
}

void arm(const dispatch_source_ref& timer, milliseconds delay) {
    dispatch_source_set_timer(timer.get(), soon(delay), DISPATCH_TIME_FOREVER, 0);
}

TEST(Timers, FireOnceEachTimeTheyAreArmed) {
    int fired = 0;
    const auto timer = makeTimer([&fired] { ++fired; });

    arm(timer, milliseconds(1));
    runMainQueueUntil([&fired] { return fired > 0; });
    runMainQueuePast(milliseconds(50));
    EXPECT_EQ(fired, 1);

    arm(timer, milliseconds(1));
    runMainQueueUntil([&fired] { return fired > 1; });
    EXPECT_EQ(fired, 2);
}

TEST(Timers, ThatAreCancelledNeverFire) {
    int fired = 0;
    const auto timer = makeTimer([&fired] { ++fired; });

    arm(timer, milliseconds(20));
    dispatch_source_cancel(timer.get());
    runMainQueuePast(milliseconds(200));

    EXPECT_EQ(fired, 0);
}

TEST(Timers, LetGoOfTheirHandlerWithTheSource) {
    auto captured = std::make_shared<int>(0);
    const std::weak_ptr<int> watched = captured;
    auto timer = makeTimer([captured = std::move(captured)] {});
    arm(timer, milliseconds(20));

    dispatch_source_cancel(timer.get());
    EXPECT_FALSE(watched.expired());
    timer.reset();

    runMainQueueUntil([&watched] { return watched.expired(); });
    EXPECT_TRUE(watched.expired());
}

TEST(Timers, ThatCouldNotBeMadeAreNull) { EXPECT_EQ(dispatch_take_source(nullptr), nullptr); }

TEST(MainQueueDraining, WithinItselfDoesNothing) {
    std::vector<std::string> calls;
    dispatch_async(dispatch_get_main_queue(), [&calls] {
        runQueuedWork();
        calls.emplace_back("outer");
    });
    dispatch_async(dispatch_get_main_queue(), [&calls] { calls.emplace_back("next"); });

    runQueuedWork();

    EXPECT_THAT(calls, ElementsAre("outer", "next"));
}

} // namespace
