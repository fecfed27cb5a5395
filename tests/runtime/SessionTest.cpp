#include <atomic>
#include <latch>
#include <thread>

#include <gmock/gmock.h>

#include "doubles/sessions/SessionDouble.h"

namespace {

using quorl::SessionDouble;
using testing::ElementsAre;
using testing::IsEmpty;

class Listener : public DVSessionObserver {
  public:
    Listener(std::string name, std::vector<std::string>& calls)
        : name_(std::move(name)), calls_(calls) {}

    void sessionWillBegin(DVSession& /*session*/) override { calls_.push_back(name_); }

  private:
    std::string name_;
    std::vector<std::string>& calls_;
};

class Sessions : public testing::Test {
  protected:
    std::shared_ptr<Listener> listener(const std::string& name) {
        return std::make_shared<Listener>(name, calls_);
    }

    void begin() {
        session_->tellObservers(
            [this](DVSessionObserver& observer) { observer.sessionWillBegin(*session_); });
    }

    std::shared_ptr<SessionDouble> session_ =
        std::make_shared<SessionDouble>("A", std::make_shared<quorl::CallRecorder>());
    std::vector<std::string> calls_;
};

TEST_F(Sessions, AreNamedByTheirConstants) {
    EXPECT_EQ(DVSessionTypeDeviceSync, "DVSessionTypeDeviceSync");
    EXPECT_EQ(DVDeviceSyncSessionAssetTaskGroupingKey, "DVDeviceSyncSessionAssetTaskGroupingKey");
}

TEST_F(Sessions, TellTheirObserversInTheOrderOfAttachment) {
    const auto first = listener("first");
    const auto second = listener("second");
    session_->addObserver(first);
    session_->addObserver(second);

    begin();

    EXPECT_THAT(calls_, ElementsAre("first", "second"));
}

TEST_F(Sessions, CountAnObserverOnceHoweverOftenItIsAttached) {
    const auto only = listener("only");
    session_->addObserver(only);
    session_->addObserver(only);

    begin();
    EXPECT_THAT(calls_, ElementsAre("only"));

    session_->removeObserver(only);
    begin();
    EXPECT_THAT(calls_, ElementsAre("only")) << "one removal is enough";
}

TEST_F(Sessions, TakeTheDetachingOfAStrangerForNoError) {
    const auto attached = listener("attached");
    session_->addObserver(attached);

    session_->removeObserver(listener("stranger"));
    begin();

    EXPECT_THAT(calls_, ElementsAre("attached"));
}

TEST_F(Sessions, DoNotOwnTheirObservers) {
    auto gone = listener("gone");
    const std::weak_ptr<Listener> watched = gone;
    session_->addObserver(gone);
    gone.reset();

    begin();

    EXPECT_TRUE(watched.expired());
    EXPECT_THAT(calls_, IsEmpty());
}

TEST_F(Sessions, AllowAnObserverToLeaveWhileItIsTold) {
    const auto first = listener("first");
    const auto second = listener("second");
    session_->addObserver(first);
    session_->addObserver(second);

    session_->tellObservers([&](DVSessionObserver& observer) {
        session_->removeObserver(first);
        observer.sessionWillBegin(*session_);
    });
    begin();

    EXPECT_THAT(calls_, ElementsAre("first", "second", "second"));
}

class Counter : public DVSessionObserver {
  public:
    void session_didUpdateSessionTask(DVSession& /*session*/, DVSessionTask& /*task*/) override {
        ++count;
    }

    std::atomic<int> count = 0;
};

TEST_F(Sessions, TellFromManyThreadsWhileObserversComeAndGo) {
    constexpr int threads = 4;
    constexpr int updates = 1'000;
    const auto task = session_->addAssetTask({});
    const auto constant = std::make_shared<Counter>();
    std::latch start(threads + 1);
    session_->quorl::ObservedSession::addObserver(constant);

    {
        std::vector<std::jthread> tellers;
        for (int teller = 0; teller < threads; ++teller) {
            tellers.emplace_back([&] {
                start.arrive_and_wait();
                for (int update = 0; update < updates; ++update) {
                    session_->tellObservers([&](DVSessionObserver& observer) {
                        observer.session_didUpdateSessionTask(*session_, *task);
                    });
                }
            });
        }
        start.arrive_and_wait();
        for (int visit = 0; visit < updates; ++visit) {
            const auto visitor = std::make_shared<Counter>();
            session_->quorl::ObservedSession::addObserver(visitor);
            session_->quorl::ObservedSession::removeObserver(visitor);
        }
    }

    EXPECT_EQ(constant->count, threads * updates);
}

} // namespace
