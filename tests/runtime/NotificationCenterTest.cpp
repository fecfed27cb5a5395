#include "runtime/objects/NotificationCenter.h"

#include <atomic>
#include <functional>
#include <thread>

#include <gmock/gmock.h>

namespace {

using quorl::NotificationCenter;
using testing::ElementsAre;
using testing::IsEmpty;

constexpr NSNotificationName somethingHappened = "SomethingHappened";
constexpr NSNotificationName somethingElse = "SomethingElse";

/// Writes its name into a common list at each call, then does what it was told to.
class Observer : public NSObject {
  public:
    void wasTold(const NSNotification& notification) {
        calls->push_back(name);
        last = notification;
        if (then) {
            then();
        }
    }

    void wasToldBriefly() { calls->push_back(name + " briefly"); }

    std::string name;
    std::vector<std::string>* calls = nullptr;
    std::function<void()> then;
    NSNotification last{};
};

class NotificationCentre : public testing::Test {
  protected:
    std::shared_ptr<Observer> observer(const std::string& name) {
        auto made = create<Observer>();
        made->name = name;
        made->calls = &calls_;
        return made;
    }

    void add(const std::shared_ptr<Observer>& observer, const NSObject* sender = nullptr,
             NSNotificationName name = somethingHappened) {
        center_->addObserver_selector_name_object(
            observer.get(), NSNotificationSelector::of<&Observer::wasTold>("wasTold:"), name,
            sender);
    }

    void post(NSObject* sender = nullptr) {
        center_->postNotificationName_object(somethingHappened, sender);
    }

    std::shared_ptr<NotificationCenter> center_ = create<NotificationCenter>();
    std::vector<std::string> calls_;
};

TEST_F(NotificationCentre, TellsTheNewestRegistrationFirst) {
    const auto first = observer("first");
    const auto second = observer("second");
    const auto third = observer("third");
    add(first);
    add(second);
    add(third);

    post();

    EXPECT_THAT(calls_, ElementsAre("third", "second", "first"));
}

TEST_F(NotificationCentre, TellsOnlyWhoRegisteredForThatName) {
    const auto listener = observer("listener");
    add(listener, nullptr, somethingElse);

    post();

    EXPECT_THAT(calls_, IsEmpty());
}

TEST_F(NotificationCentre, TellsTheNameAndTheSender) {
    const auto listener = observer("listener");
    const auto sender = create<NSObject>();
    add(listener);

    post(sender.get());

    EXPECT_EQ(listener->last.name, somethingHappened);
    EXPECT_EQ(listener->last.object, sender.get());
}

TEST_F(NotificationCentre, MatchesANameByItsTextAndNotByItsAddress) {
    const auto listener = observer("listener");
    const std::string sameText("SomethingHappened");
    add(listener);

    center_->postNotificationName_object(sameText, nullptr);

    EXPECT_THAT(calls_, ElementsAre("listener"));
}

TEST_F(NotificationCentre, TellsOfOneSenderOnlyWhereThatWasWanted) {
    const auto sender = create<NSObject>();
    const auto stranger = create<NSObject>();
    const auto choosy = observer("choosy");
    const auto open = observer("open");
    add(choosy, sender.get());
    add(open);

    post(stranger.get());
    EXPECT_THAT(calls_, ElementsAre("open"));
    post(nullptr);
    EXPECT_THAT(calls_, ElementsAre("open", "open"));
    post(sender.get());
    EXPECT_THAT(calls_, ElementsAre("open", "open", "open", "choosy"));
}

TEST_F(NotificationCentre, CallsAnObserverOncePerRegistration) {
    const auto listener = observer("listener");
    add(listener);
    add(listener);

    post();

    EXPECT_THAT(calls_, ElementsAre("listener", "listener"));
}

TEST_F(NotificationCentre, CallsMethodsWithoutAnArgument) {
    const auto listener = observer("listener");
    center_->addObserver_selector_name_object(
        listener.get(), NSNotificationSelector::of<&Observer::wasToldBriefly>("wasToldBriefly"),
        somethingHappened, nullptr);

    post();

    EXPECT_THAT(calls_, ElementsAre("listener briefly"));
}

TEST_F(NotificationCentre, ForgetsEveryRegistrationOfOneThatLeaves) {
    const auto leaver = observer("leaver");
    const auto stayer = observer("stayer");
    add(leaver);
    add(leaver, nullptr, somethingElse);
    add(stayer);
    add(leaver);

    center_->removeObserver(leaver.get());
    post();
    center_->postNotificationName_object(somethingElse, nullptr);

    EXPECT_THAT(calls_, ElementsAre("stayer"));
}

TEST_F(NotificationCentre, TakesTheLeavingOfAStrangerForNoError) {
    const auto stranger = observer("stranger");

    center_->removeObserver(stranger.get());
    post();

    EXPECT_THAT(calls_, IsEmpty());
}

TEST_F(NotificationCentre, DoesNotCallOneThatLeftDuringThePost) {
    const auto leaver = observer("leaver");
    const auto newer = observer("newer");
    add(leaver);
    add(newer);
    newer->then = [&] { center_->removeObserver(leaver.get()); };

    post();

    EXPECT_THAT(calls_, ElementsAre("newer"));
}

TEST_F(NotificationCentre, DoesNotCallOneThatWasDestroyedDuringThePost) {
    auto shortLived = observer("short-lived");
    const auto newer = observer("newer");
    add(shortLived);
    add(newer);
    newer->then = [&] { shortLived.reset(); };

    post();

    EXPECT_THAT(calls_, ElementsAre("newer"));
}

TEST_F(NotificationCentre, KeepsAnObserverAliveForItsOwnCall) {
    auto listener = observer("listener");
    const auto raw = listener.get();
    std::weak_ptr<Observer> watched = listener;
    add(listener);
    bool wasAlive = false;
    listener->then = [&] {
        listener.reset();
        wasAlive = !watched.expired() && raw->name == "listener";
    };

    post();

    EXPECT_TRUE(wasAlive);
    EXPECT_TRUE(watched.expired());
}

TEST_F(NotificationCentre, CallsOneThatCameDuringThePostFromTheNextPostOn) {
    const auto newcomer = observer("newcomer");
    const auto inviter = observer("inviter");
    add(inviter);
    inviter->then = [&] {
        add(newcomer);
        inviter->then = nullptr;
    };

    post();
    EXPECT_THAT(calls_, ElementsAre("inviter"));
    post();
    EXPECT_THAT(calls_, ElementsAre("inviter", "newcomer", "inviter"));
}

TEST_F(NotificationCentre, TakesAPostWithinAPost) {
    const auto outer = observer("outer");
    const auto inner = observer("inner");
    add(outer);
    add(inner, nullptr, somethingElse);
    outer->then = [&] { center_->postNotificationName_object(somethingElse, nullptr); };

    post();

    EXPECT_THAT(calls_, ElementsAre("outer", "inner"));
}

TEST_F(NotificationCentre, CallsOnTheThreadThatPosts) {
    const auto listener = observer("listener");
    std::thread::id told;
    add(listener);
    listener->then = [&] { told = std::this_thread::get_id(); };

    std::jthread poster([&] { post(); });
    const auto expected = poster.get_id();
    poster.join();

    EXPECT_EQ(told, expected);
}

/// Counts, so that it may be told from several threads.
class Counter : public NSObject {
  public:
    void wasTold() { ++count; }

    std::atomic<int> count = 0;
};

TEST_F(NotificationCentre, LosesNoPostWhileObserversComeAndGoOnOtherThreads) {
    constexpr int posts = 2'000;
    const auto selector = NSNotificationSelector::of<&Counter::wasTold>("wasTold");
    const auto constant = create<Counter>();
    center_->addObserver_selector_name_object(constant.get(), selector, somethingHappened, nullptr);

    {
        std::jthread visitors([&] {
            for (int visit = 0; visit < posts; ++visit) {
                const auto visitor = create<Counter>();
                center_->addObserver_selector_name_object(visitor.get(), selector,
                                                          somethingHappened, nullptr);
                center_->removeObserver(visitor.get());
            }
        });
        std::jthread poster([&] {
            for (int number = 0; number < posts; ++number) {
                post();
            }
        });
        for (int number = 0; number < posts; ++number) {
            post();
        }
    }

    EXPECT_EQ(constant->count, 2 * posts);
}

} // namespace
