#include "doubles/virtual-time/VirtualTime.h"

#include <future>
#include <thread>

#include <gmock/gmock.h>

#include "platform/Dispatch.h"

namespace {

using quorl::VirtualTime;
using testing::ElementsAre;
using testing::IsEmpty;

constexpr std::int64_t second = 1'000'000'000; // nanoseconds

VirtualTime& time() { return VirtualTime::shared(); }

dispatch_time_t in(std::int64_t nanoseconds) {
    return dispatch_time(DISPATCH_TIME_NOW, nanoseconds);
}

class VirtualTimeTest : public testing::Test {
  protected:
    std::function<void()> note(const std::string& what) {
        return [this, what] { notes.push_back(what); };
    }

    void noteAfter(std::int64_t delay, const std::string& what) {
        dispatch_after(in(delay), dispatch_get_main_queue(), note(what));
    }

    dispatch_source_ref makeTimer(const std::string& what) {
        auto timer = dispatch_take_source(
            dispatch_source_create(DISPATCH_SOURCE_TYPE_TIMER, 0, 0, dispatch_get_main_queue()));
        dispatch_source_set_event_handler(timer.get(), note(what));
        return timer;
    }

    static void arm(const dispatch_source_ref& timer, std::int64_t delay,
                    std::uint64_t interval = DISPATCH_TIME_FOREVER) {
        dispatch_source_set_timer(timer.get(), in(delay), interval, 0);
    }

    void TearDown() override {
        time().setObserver(nullptr);
        time().advance(100 * second); // what a test left armed is not the next one's
        time().drain();
    }

    std::vector<std::string> notes;
};

TEST_F(VirtualTimeTest, WorkOfTheMainQueueRunsInOrderWhenItIsDrained) {
    dispatch_async(dispatch_get_main_queue(), note("first"));
    dispatch_async(dispatch_get_main_queue(), [this] {
        notes.emplace_back("second");
        dispatch_async(dispatch_get_main_queue(), note("queued by the second"));
    });
    dispatch_async(dispatch_get_main_queue(), note("third"));
    EXPECT_THAT(notes, IsEmpty());

    time().drain();

    EXPECT_THAT(notes, ElementsAre("first", "second", "third", "queued by the second"));
}

TEST_F(VirtualTimeTest, WorkQueuedByOtherThreadsAllRunsOnTheDrainingThread) {
    constexpr int threads = 4;
    constexpr int posts = 20'000;
    int runs = 0;
    int strangers = 0;
    const auto main = std::this_thread::get_id();
    std::vector<std::thread> posters;
    for (int thread = 0; thread < threads; ++thread) {
        posters.emplace_back([&] {
            for (int post = 0; post < posts; ++post) {
                dispatch_async(dispatch_get_main_queue(), [&] {
                    ++runs;
                    strangers += std::this_thread::get_id() == main ? 0 : 1;
                });
            }
        });
    }
    time().drain(); // while they post
    for (auto& poster : posters) {
        poster.join();
    }

    time().drain();

    EXPECT_EQ(runs, threads * posts);
    EXPECT_EQ(strangers, 0);
}

TEST_F(VirtualTimeTest, DelayedWorkRunsWhenItsTimeHasComeAndNotANanosecondEarlier) {
    noteAfter(2 * second, "late");
    time().advance(2 * second - 1);
    EXPECT_THAT(notes, IsEmpty());

    time().advance(1);

    EXPECT_THAT(notes, ElementsAre("late"));
}

TEST_F(VirtualTimeTest, WhatIsDueNowRunsAtTheNextDrain) {
    dispatch_after(DISPATCH_TIME_NOW, dispatch_get_main_queue(), note("now"));
    noteAfter(-5, "in the past");
    const auto timer = makeTimer("timer");
    arm(timer, 0);
    dispatch_resume(timer.get());

    time().drain();

    EXPECT_THAT(notes, ElementsAre("now", "in the past", "timer"));
}

TEST_F(VirtualTimeTest, TimersOfOneInstantFireInTheOrderInWhichTheyWereArmed) {
    const auto early = makeTimer("armed third");
    const auto late = makeTimer("armed first");
    dispatch_resume(early.get());
    dispatch_resume(late.get());
    arm(early, second);
    arm(late, second);
    noteAfter(second, "armed second");
    arm(early, second);

    time().advance(second);

    EXPECT_THAT(notes, ElementsAre("armed first", "armed second", "armed third"));
}

TEST_F(VirtualTimeTest, EachTimerSeesItsOwnInstantAndTheMainQueueRunsBetweenThem) {
    const auto start = time().now();
    std::vector<std::uint64_t> instants;
    dispatch_after(in(3), dispatch_get_main_queue(), [&] {
        instants.push_back(time().now() - start);
        dispatch_async(dispatch_get_main_queue(), note("queued by the first"));
    });
    dispatch_after(in(5), dispatch_get_main_queue(), [&] {
        instants.push_back(time().now() - start);
        notes.emplace_back("second");
    });

    time().advance(9);

    EXPECT_THAT(instants, ElementsAre(3, 5));
    EXPECT_THAT(notes, ElementsAre("queued by the first", "second"));
    EXPECT_EQ(time().now() - start, 9);
}

TEST_F(VirtualTimeTest, TimePassingWithoutATimerLeavesTheMainQueueAlone) {
    dispatch_async(dispatch_get_main_queue(), note("queued"));

    time().advance(second);

    EXPECT_THAT(notes, IsEmpty());
}

TEST_F(VirtualTimeTest, ATimerThatIsArmedAgainForgetsTheFirstTime) {
    const auto timer = makeTimer("fired");
    dispatch_resume(timer.get());
    arm(timer, second);
    arm(timer, 3 * second);
    time().advance(2 * second);
    EXPECT_THAT(notes, IsEmpty());

    time().advance(10 * second);

    EXPECT_THAT(notes, ElementsAre("fired")); // and only once
}

TEST_F(VirtualTimeTest, ATimerThatWasDisarmedDoesNotFireUntilItIsArmedAgain) {
    const auto timer = makeTimer("fired");
    dispatch_resume(timer.get());
    arm(timer, second);
    dispatch_source_set_timer(timer.get(), DISPATCH_TIME_FOREVER, 0, 0);
    time().advance(5 * second);
    EXPECT_THAT(notes, IsEmpty());

    arm(timer, second);
    time().advance(second);

    EXPECT_THAT(notes, ElementsAre("fired"));
}

TEST_F(VirtualTimeTest, ARepeatingTimerFiresAtEachOfItsInstants) {
    const auto timer = makeTimer("fired");
    dispatch_resume(timer.get());
    arm(timer, second, 2 * second);

    time().advance(5 * second);

    EXPECT_THAT(notes, ElementsAre("fired", "fired", "fired"));
    dispatch_source_cancel(timer.get());
}

TEST_F(VirtualTimeTest, ATimerIsSilentUntilItIsResumed) {
    const auto timer = makeTimer("fired");
    arm(timer, second);
    time().advance(2 * second);
    EXPECT_THAT(notes, IsEmpty());

    dispatch_resume(timer.get());
    time().drain();

    EXPECT_THAT(notes, ElementsAre("fired"));
}

TEST_F(VirtualTimeTest, ACancelledTimerDoesNotFire) {
    const auto timer = makeTimer("fired");
    dispatch_resume(timer.get());
    arm(timer, second);

    dispatch_source_cancel(timer.get());
    time().advance(2 * second);

    EXPECT_THAT(notes, IsEmpty());
}

TEST_F(VirtualTimeTest, ATimerThatIsLetGoOfTakesItsHandlerAlong) {
    auto owned = std::make_shared<int>(0);
    const std::weak_ptr<int> handler = owned;
    auto timer = dispatch_take_source(
        dispatch_source_create(DISPATCH_SOURCE_TYPE_TIMER, 0, 0, dispatch_get_main_queue()));
    dispatch_source_set_event_handler(timer.get(), [owned = std::move(owned)] { ++*owned; });
    dispatch_resume(timer.get());
    arm(timer, second);

    timer = nullptr;
    time().advance(2 * second);
    time().drain();

    EXPECT_TRUE(handler.expired());
}

TEST_F(VirtualTimeTest, AHandlerMayLetGoOfItsOwnTimer) {
    auto timer = dispatch_take_source(
        dispatch_source_create(DISPATCH_SOURCE_TYPE_TIMER, 0, 0, dispatch_get_main_queue()));
    const std::string text(100, 'x'); // lives in the handler, and is read after the timer has gone
    dispatch_source_set_event_handler(timer.get(), [&timer, text, this] {
        dispatch_source_cancel(timer.get());
        timer = nullptr;
        notes.push_back(text);
    });
    dispatch_resume(timer.get());
    arm(timer, second);

    time().advance(second);

    EXPECT_THAT(notes, ElementsAre(text));
}

TEST_F(VirtualTimeTest, ForeverStaysForever) {
    time().advance(1);
    EXPECT_EQ(dispatch_time(DISPATCH_TIME_FOREVER, -second), DISPATCH_TIME_FOREVER);
    EXPECT_EQ(in(INT64_MAX), DISPATCH_TIME_FOREVER);
    // A closure would never be let go of.
    dispatch_after_f(DISPATCH_TIME_FOREVER, dispatch_get_main_queue(), &notes, [](void* list) {
        static_cast<std::vector<std::string>*>(list)->emplace_back("never");
    });

    time().advance(1000 * second);

    EXPECT_THAT(notes, IsEmpty());
}

TEST_F(VirtualTimeTest, ATimeCountsFromAnotherTime) {
    const dispatch_time_t later = dispatch_time(dispatch_time(in(2 * second), second), -second);
    dispatch_after(later, dispatch_get_main_queue(), note("after two seconds"));
    time().advance(2 * second - 1);
    EXPECT_THAT(notes, IsEmpty());

    time().advance(1);

    EXPECT_THAT(notes, ElementsAre("after two seconds"));
}

TEST_F(VirtualTimeTest, WorkOfOtherQueuesRunsOnTheirThreads) {
    auto* const queue = dispatch_get_global_queue(DISPATCH_QUEUE_PRIORITY_DEFAULT, 0);
    std::promise<std::thread::id> atOnce;
    std::promise<std::thread::id> delayed;
    dispatch_async(queue, [&] { atOnce.set_value(std::this_thread::get_id()); });
    dispatch_after(in(second), queue, [&] { delayed.set_value(std::this_thread::get_id()); });

    time().advance(second);

    EXPECT_NE(atOnce.get_future().get(), std::this_thread::get_id());
    EXPECT_NE(delayed.get_future().get(), std::this_thread::get_id());
}

TEST_F(VirtualTimeTest, TheObserverIsToldOfCallsWithTheirFigures) {
    time().setObserver([this](auto function, auto figures) {
        std::string call(function);
        for (const std::uint64_t figure : figures) {
            call += figure == DISPATCH_TIME_FOREVER ? " forever" : " " + std::to_string(figure);
        }
        notes.push_back(call);
    });

    auto timer = makeTimer("fired");
    dispatch_resume(timer.get());
    dispatch_source_set_timer(timer.get(), in(7), DISPATCH_TIME_FOREVER, 3);
    dispatch_after(in(5), dispatch_get_main_queue(), [] {});
    dispatch_source_set_timer(timer.get(), DISPATCH_TIME_FOREVER, 0, 0);
    dispatch_source_cancel(timer.get());

    EXPECT_THAT(notes,
                ElementsAre("dispatch_source_create", "dispatch_resume",
                            "dispatch_source_set_timer 7 forever 3", "dispatch_after 5",
                            "dispatch_source_set_timer forever 0 0", "dispatch_source_cancel"));
}

TEST_F(VirtualTimeTest, TheHostsOwnDelaysFallIntoTheSameOrderAndAreNotTold) {
    time().setObserver([this](auto function, auto /*figures*/) { notes.emplace_back(function); });
    time().schedule(second, note("host"));
    noteAfter(second, "plug-in");

    time().advance(second);

    EXPECT_THAT(notes, ElementsAre("dispatch_after", "host", "plug-in"));
}

} // namespace
