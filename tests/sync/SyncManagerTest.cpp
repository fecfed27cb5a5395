#include <array>
#include <atomic>
#include <latch>
#include <limits>
#include <thread>

#include <gmock/gmock.h>

#include "platform/Dispatch.h"
#include "platform/UserInterface.h"
#include "sync/LMQuorlSyncManager.h"
#include "tests/support/TestHost.h"
#include "tests/support/VirtualRun.h"

namespace {

using quorl::PlaylistDouble;
using quorl::SyncPreference;
using quorl::TaskFigures;
using quorl::tests::drain;
using quorl::tests::TestHost;
using testing::ElementsAre;
using testing::IsEmpty;

constexpr auto largestWord = std::numeric_limits<NSUInteger>::max();
constexpr NSUInteger beyondHalfAWord = NSUInteger{1} << (4 * sizeof(NSUInteger));

/// Counts the status notifications and notes who sent the last one, and on which thread.
class StatusObserver : public NSObject {
  public:
    void statusDidChange(const NSNotification& notification) {
        ++count;
        sender = notification.object;
        thread = std::this_thread::get_id();
    }

    std::size_t count = 0;
    const NSObject* sender = nullptr;
    std::thread::id thread;
};

class SyncManager : public testing::Test {
  protected:
    /// The manager, attached to the sessions that there are, with its first status posted.
    LMQuorlSyncManager& manager() {
        const auto& shared = LMQuorlSyncManager::sharedManager();
        if (!observer_) {
            drain();
            observer_ = create<StatusObserver>();
            NSNotificationCenter::defaultCenter().addObserver_selector_name_object(
                observer_.get(),
                NSNotificationSelector::of<&StatusObserver::statusDidChange>("statusDidChange:"),
                LMQuorlSyncStatusDidChangeNotification, nullptr);
            host_->journal.clear();
        }
        return *shared;
    }

    /// How many status notifications have come since the manager was there.
    [[nodiscard]] std::size_t posts() const { return observer_->count; }

    static void post(NSNotificationName name) {
        NSNotificationCenter::defaultCenter().postNotificationName_object(name, nullptr);
    }

    void store(SyncPreference preference, std::optional<std::uint64_t> value) {
        (void)host_->preferences.setValue(preference, value);
    }

    /// Sync is on and a playlist of this revision is chosen.
    std::shared_ptr<PlaylistDouble> choosePlaylist(std::uint64_t revision = 1) {
        const auto playlist = host_->mediaLibrary().addPlaylist(7, "Morning");
        playlist->setRevision(revision);
        store(SyncPreference::AssetSyncEnabled, 1);
        store(SyncPreference::AssetSyncPlaylistPersistentID, 7);
        return playlist;
    }

    void storeLastSent(std::optional<std::uint64_t> persistentID,
                       std::optional<std::uint64_t> version) {
        store(SyncPreference::LastFullySentAssetSyncPlaylistPersistentID, persistentID);
        store(SyncPreference::LastFullySentAssetSyncPlaylistVersion, version);
    }

    std::shared_ptr<TestHost> host_ = TestHost::installed();
    std::shared_ptr<StatusObserver> observer_;
};

TEST_F(SyncManager, BeginsByListeningAndAttachingAndPostsAStatusLater) {
    host_->sessionService.add("A");
    host_->sessionService.add("B");

    const auto& manager = LMQuorlSyncManager::sharedManager();

    ASSERT_NE(manager, nullptr);
    EXPECT_THAT(host_->journal.lines({"observe", "sessions", "session", "post"}),
                ElementsAre("observe UIApplicationDidEnterBackgroundNotification "
                            "_applicationDidEnterBackgroundNotification: any",
                            "observe UIApplicationWillEnterForegroundNotification "
                            "_applicationWillEnterForegroundNotification: any",
                            "observe DVSessionsDidChangeNotification "
                            "_drovanSessionsDidChangeNotification: any",
                            "observe LMSyncPreferencesDidChangeNotification "
                            "_syncPreferencesDidChangeNotification: any",
                            "sessions DVSessionTypeDeviceSync", "session A add", "session B add"));
    drain();
    EXPECT_EQ(host_->journal.count("post LMQuorlSyncStatusDidChangeNotification"), 1U);
}

TEST_F(SyncManager, IsOneForTheProcess) {
    const auto first = LMQuorlSyncManager::sharedManager();

    EXPECT_EQ(LMQuorlSyncManager::sharedManager(), first);
    EXPECT_EQ(host_->journal.count("sessions DVSessionTypeDeviceSync"), 1U);
}

/// A host that is asked for the sessions on the main thread while others ask for the manager, which
/// has just begun.
class CrowdedHost final : public quorl::HostDouble {
  public:
    using Manager = std::shared_ptr<LMQuorlSyncManager>;

    [[nodiscard]] NSArray<DVSession> sessions(const std::string& type) override {
        if (++fetches_ == 1) {
            letOthersIn();
        }
        return HostDouble::sessions(type);
    }

    [[nodiscard]] int fetches() const { return fetches_; }

    /// What the others were given, once they all have it.
    [[nodiscard]] const std::array<Manager, 7>& given() {
        others_ = {};
        return given_;
    }

  private:
    void letOthersIn() {
        for (std::size_t other = 0; other < others_.size(); ++other) {
            others_[other] = std::jthread([this, other] {
                ready_.count_down();
                given_[other] = LMQuorlSyncManager::sharedManager();
            });
        }
        ready_.arrive_and_wait();
        // Whoever is not held back now comes to the second fetch, given the processor.
        for (int turn = 0; turn < 100 && fetches_ == 1; ++turn) {
            std::this_thread::yield();
        }
    }

    std::latch ready_{8}; // the others and the main thread
    std::atomic<int> fetches_ = 0;
    std::array<Manager, 7> given_;
    std::array<std::jthread, 7> others_;
};

TEST_F(SyncManager, IsMadeOnceHoweverManyAskForItMeanwhile) {
    const auto crowd = std::make_shared<CrowdedHost>();
    quorl::Host::install(crowd);

    const auto manager = LMQuorlSyncManager::sharedManager();

    EXPECT_THAT(crowd->given(), testing::Each(manager));
    EXPECT_EQ(crowd->fetches(), 1);
}

TEST_F(SyncManager, PublishesTheNameOfItsNotification) {
    EXPECT_EQ(LMQuorlSyncStatusDidChangeNotification, "LMQuorlSyncStatusDidChangeNotification");
}

// What the status is.

TEST_F(SyncManager, IsPendingWhereAPlaylistWasNeverSent) {
    choosePlaylist();

    EXPECT_EQ(manager().syncStage(), LMQuorlSyncStagePending);
    EXPECT_EQ(manager().progress(), 1.0F);
    EXPECT_EQ(manager().completedAssetCount(), 0U);
    EXPECT_EQ(manager().totalAssetCount(), 0U);
}

TEST_F(SyncManager, IsIdleWhileSyncIsOff) {
    choosePlaylist();
    store(SyncPreference::AssetSyncEnabled, 0);

    EXPECT_EQ(manager().syncStage(), LMQuorlSyncStageIdle);
}

TEST_F(SyncManager, IsIdleWhereThePlaylistWasSentAsItIsNow) {
    choosePlaylist(5);
    storeLastSent(7, 5);

    EXPECT_EQ(manager().syncStage(), LMQuorlSyncStageIdle);
}

TEST_F(SyncManager, IsPendingWhereThePlaylistHasChangedSinceItWasSent) {
    choosePlaylist(6);
    storeLastSent(7, 5);

    EXPECT_EQ(manager().syncStage(), LMQuorlSyncStagePending);
}

TEST_F(SyncManager, IsPendingWhereAnotherPlaylistWasSent) {
    choosePlaylist(5);
    storeLastSent(8, 5);

    EXPECT_EQ(manager().syncStage(), LMQuorlSyncStagePending);
}

TEST_F(SyncManager, TakesWhatIsMissingOnEitherSideForADifference) {
    const auto playlist = choosePlaylist(5);
    storeLastSent(7, std::nullopt);
    EXPECT_EQ(manager().syncStage(), LMQuorlSyncStagePending);

    storeLastSent(std::nullopt, 5);
    EXPECT_EQ(manager().syncStage(), LMQuorlSyncStagePending);

    storeLastSent(7, 5);
    EXPECT_EQ(manager().syncStage(), LMQuorlSyncStageIdle);
    playlist->setProperty(MPMediaEntityPropertyEntityRevision, nullptr);
    EXPECT_EQ(manager().syncStage(), LMQuorlSyncStagePending);

    storeLastSent(7, std::nullopt);
    EXPECT_EQ(manager().syncStage(), LMQuorlSyncStagePending) << "missing on both sides";
}

TEST_F(SyncManager, IsIdleWithoutAPlaylistWhateverWasSent) {
    store(SyncPreference::AssetSyncEnabled, 1);
    EXPECT_EQ(manager().syncStage(), LMQuorlSyncStageIdle);

    store(SyncPreference::AssetSyncPlaylistPersistentID, 99);
    storeLastSent(7, 5);
    EXPECT_EQ(manager().syncStage(), LMQuorlSyncStageIdle) << "not in the library";
}

TEST_F(SyncManager, ComparesAll64BitsOfTheIds) {
    choosePlaylist(5);
    storeLastSent(0x1'0000'0007, 5);

    EXPECT_EQ(manager().syncStage(), LMQuorlSyncStagePending);
}

TEST_F(SyncManager, ReadsThePlaylistThenTheIdTheRevisionAndWhatWasSent) {
    choosePlaylist();
    (void)manager().syncStage(); // the playlist is remembered from here on
    host_->journal.clear();

    (void)manager().syncStage();

    EXPECT_THAT(host_->journal.lines({"read", "property", "query"}),
                ElementsAre("read assetSyncEnabled", "read assetSyncPlaylistPersistentID",
                            "read assetSyncPlaylistPersistentID",
                            "property 7 MPMediaEntityPropertyEntityRevision",
                            "read lastFullySentAssetSyncPlaylistPersistentID",
                            "read lastFullySentAssetSyncPlaylistVersion"));
}

TEST_F(SyncManager, ReadsNoPreferencesWhileSomethingIsRunning) {
    choosePlaylist();
    host_->sessionService.add("A")->addOtherTask({.isRunning = true});
    (void)manager();

    (void)manager().syncStage();

    EXPECT_THAT(host_->journal.lines({"read", "query", "property"}), IsEmpty());
}

struct Stage {
    const char* situation;
    std::vector<TaskFigures> assetTasks;
    std::vector<TaskFigures> otherTasks;
    LMQuorlSyncStage expected;
};

class SyncStages : public SyncManager, public testing::WithParamInterface<Stage> {};

TEST_P(SyncStages, FollowFromTheRunningTasks) {
    choosePlaylist();
    const auto session = host_->sessionService.add("A");
    for (const auto& figures : GetParam().assetTasks) {
        session->addAssetTask(figures);
    }
    for (const auto& figures : GetParam().otherTasks) {
        session->addOtherTask(figures);
    }

    EXPECT_EQ(manager().syncStage(), GetParam().expected) << GetParam().situation;
}

INSTANTIATE_TEST_SUITE_P(
    Table, SyncStages,
    testing::Values(
        Stage{"no task", {}, {}, LMQuorlSyncStagePending},
        Stage{"asset task that still counts",
              {{.isRunning = true, .total = 0}},
              {},
              LMQuorlSyncStageIndeterminateSyncing},
        Stage{"other kind of task",
              {},
              {{.isRunning = true, .total = 9}},
              LMQuorlSyncStageIndeterminateSyncing},
        Stage{"one asset task counts, one has counted",
              {{.isRunning = true, .total = 0}, {.isRunning = true, .total = 5}},
              {},
              LMQuorlSyncStageSyncing},
        Stage{"asset task beside another kind",
              {{.isRunning = true, .total = 5}},
              {{.isRunning = true, .total = 0}},
              LMQuorlSyncStageSyncing},
        Stage{"asset task that does not run", {{.total = 5}}, {}, LMQuorlSyncStagePending},
        Stage{"asset task that does not run beside another kind that does",
              {{.total = 5}},
              {{.isRunning = true}},
              LMQuorlSyncStageIndeterminateSyncing},
        Stage{"total that half a word cannot hold",
              {{.isRunning = true, .total = beyondHalfAWord}},
              {},
              LMQuorlSyncStageSyncing},
        Stage{"totals that wrap around to 0 count as 0",
              {{.isRunning = true, .total = largestWord}, {.isRunning = true, .total = 1}},
              {},
              LMQuorlSyncStageIndeterminateSyncing}));

TEST_F(SyncManager, LooksAtTheTasksOfAllSessionsForTheStage) {
    host_->sessionService.add("A")->addOtherTask({});
    host_->sessionService.add("B")->addAssetTask({.isRunning = true, .total = 3});

    EXPECT_EQ(manager().syncStage(), LMQuorlSyncStageSyncing);
}

TEST_F(SyncManager, LetsThePreferencesDecideWhereTheIdleTasksHaveItems) {
    choosePlaylist(5);
    storeLastSent(7, 5);
    host_->sessionService.add("A")->addAssetTask({.total = 5});

    EXPECT_EQ(manager().syncStage(), LMQuorlSyncStageIdle);
}

TEST_F(SyncManager, ComputesEachAnswerAnew) {
    const auto task = host_->sessionService.add("A")->addAssetTask({.isRunning = true, .total = 0});
    ASSERT_EQ(manager().syncStage(), LMQuorlSyncStageIndeterminateSyncing);

    task->become({.isRunning = true, .total = 8, .completed = 2, .progress = 0.25});

    EXPECT_EQ(manager().syncStage(), LMQuorlSyncStageSyncing);
    EXPECT_EQ(manager().progress(), 0.25F);
    EXPECT_EQ(manager().completedAssetCount(), 2U);
    EXPECT_EQ(manager().totalAssetCount(), 8U);
}

TEST_F(SyncManager, HasTheMeanProgressOfAllAssetTasks) {
    const auto finished = host_->sessionService.add("finished");
    finished->addAssetTask({.total = 1, .progress = 1.0});
    finished->finish();
    const auto running = host_->sessionService.add("running");
    running->addAssetTask({.isRunning = true, .total = 1000, .progress = 0.5});
    running->addOtherTask({.isRunning = true, .progress = 0.0});

    EXPECT_EQ(manager().progress(), 0.75F);
}

TEST_F(SyncManager, CountsWaitingTasksIntoTheProgress) {
    const auto session = host_->sessionService.add("A");
    session->addAssetTask({.isRunning = true, .progress = 0.5});
    session->addAssetTask({.isRunning = false, .progress = 0.0});

    EXPECT_EQ(manager().progress(), 0.25F);
}

TEST_F(SyncManager, HasAllProgressOnceEverySessionHasFinished) {
    const auto session = host_->sessionService.add("A");
    session->addAssetTask({.progress = 0.2});
    session->finish();

    EXPECT_EQ(manager().progress(), 1.0F);
}

TEST_F(SyncManager, AsksEverySessionWhetherItHasFinished) {
    host_->sessionService.add("running");
    host_->sessionService.add("finished")->finish();
    EXPECT_EQ(manager().progress(), 0.0F);
}

TEST_F(SyncManager, HasNoProgressWithoutAssetTasks) {
    host_->sessionService.add("A")->addOtherTask({.isRunning = true, .progress = 0.9});

    EXPECT_EQ(manager().progress(), 0.0F);
}

TEST_F(SyncManager, DoesNotHoldItsProgressBetween0And1) {
    const auto task =
        host_->sessionService.add("A")->addAssetTask({.isRunning = true, .progress = 1.5});
    EXPECT_EQ(manager().progress(), 1.5F);

    task->become({.isRunning = true, .progress = -0.5});
    EXPECT_EQ(manager().progress(), -0.5F);
}

TEST_F(SyncManager, DividesInDoublePrecisionAndNarrowsAfterwards) {
    const auto session = host_->sessionService.add("A");
    session->addAssetTask({.progress = 0.01});
    session->addAssetTask({.progress = 0.02});
    session->addAssetTask({.progress = 0.05});
    constexpr double sum = 0.01 + 0.02 + 0.05;
    static_assert(static_cast<float>(sum / 3) != static_cast<float>(sum) / 3);

    EXPECT_EQ(manager().progress(), static_cast<float>(sum / 3));
}

TEST_F(SyncManager, CountsTheItemsOfAllAssetTasksRunningOrNot) {
    const auto one = host_->sessionService.add("A");
    one->addAssetTask({.isRunning = true, .total = 10, .completed = 4});
    one->addAssetTask({.total = 5, .completed = 5});
    one->addOtherTask({.isRunning = true, .total = 100, .completed = 100});
    const auto finished = host_->sessionService.add("B");
    finished->addAssetTask({.total = 3, .completed = 3});
    finished->finish();

    EXPECT_EQ(manager().completedAssetCount(), 12U);
    EXPECT_EQ(manager().totalAssetCount(), 18U);
}

TEST_F(SyncManager, CountsItemsInWholeWords) {
    const auto session = host_->sessionService.add("A");
    session->addAssetTask({.total = beyondHalfAWord + 2, .completed = beyondHalfAWord + 1});
    session->addAssetTask({.total = 3, .completed = 2});

    EXPECT_EQ(manager().completedAssetCount(), beyondHalfAWord + 3);
    EXPECT_EQ(manager().totalAssetCount(), beyondHalfAWord + 5);
}

TEST_F(SyncManager, TakesMissingTaskListsForEmptyOnes) {
    host_->sessionService.add("A")->loseTasks();

    EXPECT_EQ(manager().syncStage(), LMQuorlSyncStageIdle);
    EXPECT_EQ(manager().progress(), 0.0F);
    EXPECT_EQ(manager().totalAssetCount(), 0U);
}

// When it is announced.

using Callback = void (*)(DVSessionObserver& observer, DVSession& session, DVSessionTask& task);

struct SessionEvent {
    const char* name;
    Callback tell;
    std::size_t posts;
};

class SessionEvents : public SyncManager, public testing::WithParamInterface<SessionEvent> {};

TEST_P(SessionEvents, AreAnsweredWithOnePostLater) {
    const auto session = host_->sessionService.add("A");
    const auto task = session->addAssetTask({});
    (void)manager();

    session->tellObservers(
        [&](DVSessionObserver& observer) { GetParam().tell(observer, *session, *task); });
    EXPECT_EQ(posts(), 0U) << "never before the caller has gone on";
    drain();

    EXPECT_EQ(posts(), GetParam().posts) << GetParam().name;
}

INSTANTIATE_TEST_SUITE_P(
    Table, SessionEvents,
    testing::Values(SessionEvent{"session begins",
                                 [](auto& observer, auto& session, auto&) {
                                     observer.sessionWillBegin(session);
                                 },
                                 1},
                    SessionEvent{"session ends",
                                 [](auto& observer, auto& session, auto&) {
                                     observer.sessionDidFinish(session);
                                 },
                                 1},
                    SessionEvent{"task is about to begin",
                                 [](auto& observer, auto& session, auto& task) {
                                     observer.session_willBeginSessionTask(session, task);
                                 },
                                 1},
                    SessionEvent{"task has begun",
                                 [](auto& observer, auto& session, auto& task) {
                                     observer.session_didBeginSessionTask(session, task);
                                 },
                                 0},
                    SessionEvent{"task goes on",
                                 [](auto& observer, auto& session, auto& task) {
                                     observer.session_didUpdateSessionTask(session, task);
                                 },
                                 1},
                    SessionEvent{"task ends",
                                 [](auto& observer, auto& session, auto& task) {
                                     observer.session_didFinishSessionTask(session, task);
                                 },
                                 1}));

TEST_F(SyncManager, PostsOncePerCauseOnTheMainThreadAsTheSender) {
    const auto session = host_->sessionService.add("A");
    (void)manager();

    for (int event = 0; event < 3; ++event) {
        session->tellObservers(
            [&](DVSessionObserver& observer) { observer.sessionWillBegin(*session); });
    }
    drain();

    EXPECT_EQ(posts(), 3U);
    EXPECT_EQ(observer_->sender, &manager());
    EXPECT_EQ(observer_->thread, std::this_thread::get_id());
}

TEST_F(SyncManager, PostsOnTheMainThreadWhatASessionTellsOnOthers) {
    constexpr std::size_t threads = 4;
    constexpr std::size_t events = 250;
    const auto session = host_->sessionService.add("A");
    const auto task = session->addAssetTask({});
    (void)manager();

    {
        std::array<std::jthread, threads> tellers;
        for (auto& teller : tellers) {
            teller = std::jthread([&] {
                for (std::size_t event = 0; event < events; ++event) {
                    session->tellObservers([&](DVSessionObserver& observer) {
                        observer.session_didUpdateSessionTask(*session, *task);
                    });
                }
            });
        }
    }
    drain();

    EXPECT_EQ(posts(), threads * events);
    EXPECT_EQ(observer_->thread, std::this_thread::get_id());
}

TEST_F(SyncManager, AnswersAPreferencesChangeWithOnePostAndNoFetch) {
    (void)manager();

    post(LMSyncPreferencesDidChangeNotification);
    EXPECT_EQ(posts(), 0U);
    drain();

    EXPECT_EQ(posts(), 1U);
    EXPECT_THAT(host_->journal.lines({"sessions", "session"}), IsEmpty());
}

// Which sessions it is attached to.

TEST_F(SyncManager, LeavesTheOldSessionsAndJoinsTheNewOnesWhenTheyChange) {
    host_->sessionService.add("A");
    host_->sessionService.add("B");
    (void)manager();
    host_->sessionService.replace({});
    const auto added = host_->sessionService.add("C");
    added->addAssetTask({.isRunning = true, .total = 1});

    post(DVSessionsDidChangeNotification);

    EXPECT_THAT(host_->journal.lines({"sessions", "session"}),
                ElementsAre("session A remove", "session B remove",
                            "sessions DVSessionTypeDeviceSync", "session C add"));
    EXPECT_EQ(manager().syncStage(), LMQuorlSyncStageSyncing);
    drain();
    EXPECT_EQ(posts(), 1U);
}

/// A host whose only session answers whoever joins it with work of its own on the main queue.
class AnsweringHost final : public quorl::HostDouble {
  public:
    [[nodiscard]] NSArray<DVSession> sessions(const std::string& /*type*/) override {
        return std::make_shared<std::vector<std::shared_ptr<DVSession>>>(1, session_);
    }

    /// What has come to the main queue, in this order.
    [[nodiscard]] static std::vector<std::string>& arrived() {
        static std::vector<std::string> all;
        return all;
    }

  private:
    class Session final : public quorl::ObservedSession {
      public:
        void addObserver(const std::shared_ptr<DVSessionObserver>& observer) override {
            ObservedSession::addObserver(observer);
            dispatch_async(dispatch_get_main_queue(), [] { arrived().emplace_back("answer"); });
        }

        [[nodiscard]] bool isFinished() const override { return false; }

        [[nodiscard]] NSArray<DVSessionTask> sessionTasks() const override { return nullptr; }

        [[nodiscard]] NSArray<DVSessionTask>
        sessionTasksWithGroupingKey(const std::string& /*key*/) const override {
            return nullptr;
        }
    };

    std::shared_ptr<Session> session_ = create<Session>();
};

/// Notes that a status has come.
class Arrivals : public NSObject {
  public:
    void statusDidChange(const NSNotification& /*notification*/) {
        AnsweringHost::arrived().emplace_back("status");
    }
};

TEST_F(SyncManager, JoinsTheNewSessionsBeforeItQueuesItsPost) {
    quorl::Host::install(std::make_shared<AnsweringHost>());
    const auto arrivals = create<Arrivals>();
    NSNotificationCenter::defaultCenter().addObserver_selector_name_object(
        arrivals.get(), NSNotificationSelector::of<&Arrivals::statusDidChange>("statusDidChange:"),
        LMQuorlSyncStatusDidChangeNotification, nullptr);

    (void)LMQuorlSyncManager::sharedManager();
    drain();

    EXPECT_THAT(AnsweringHost::arrived(), ElementsAre("answer", "status"));
}

TEST_F(SyncManager, KnowsANewSessionOnlyOnceItIsAnnounced) {
    (void)manager();

    host_->sessionService.add("A")->addAssetTask({.isRunning = true, .total = 1});
    EXPECT_EQ(manager().syncStage(), LMQuorlSyncStageIdle);

    post(DVSessionsDidChangeNotification);
    EXPECT_EQ(manager().syncStage(), LMQuorlSyncStageSyncing);
}

TEST_F(SyncManager, LeavesItsSessionsInTheBackgroundAndJoinsTheSameOnesAgain) {
    const auto session = host_->sessionService.add("A");
    (void)manager();
    host_->sessionService.replace({}); // unannounced

    post(UIApplicationDidEnterBackgroundNotification);
    session->tellObservers(
        [&](DVSessionObserver& observer) { observer.sessionDidFinish(*session); });
    post(UIApplicationWillEnterForegroundNotification);
    drain();

    EXPECT_THAT(host_->journal.lines({"sessions", "session"}),
                ElementsAre("session A remove", "session A add"));
    EXPECT_EQ(posts(), 0U);
    session->tellObservers(
        [&](DVSessionObserver& observer) { observer.sessionDidFinish(*session); });
    drain();
    EXPECT_EQ(posts(), 1U);
}

TEST_F(SyncManager, AnswersQuestionsFromItsListInTheBackgroundToo) {
    host_->sessionService.add("A")->addAssetTask({.isRunning = true, .total = 1});
    (void)manager();

    post(UIApplicationDidEnterBackgroundNotification);

    EXPECT_EQ(manager().syncStage(), LMQuorlSyncStageSyncing);
}

TEST_F(SyncManager, HearsOfPreferencesAndSessionsInTheBackgroundToo) {
    (void)manager();
    post(UIApplicationDidEnterBackgroundNotification);

    post(LMSyncPreferencesDidChangeNotification);
    drain();
    EXPECT_EQ(posts(), 1U);

    const auto session = host_->sessionService.add("A");
    post(DVSessionsDidChangeNotification);
    drain();
    EXPECT_EQ(posts(), 2U);
    session->tellObservers(
        [&](DVSessionObserver& observer) { observer.sessionDidFinish(*session); });
    drain();
    EXPECT_EQ(posts(), 3U);
}

TEST_F(SyncManager, HearsASessionOnceHoweverOftenTheAppComesBack) {
    const auto session = host_->sessionService.add("A");
    (void)manager();

    post(UIApplicationWillEnterForegroundNotification);
    post(UIApplicationWillEnterForegroundNotification);
    session->tellObservers(
        [&](DVSessionObserver& observer) { observer.sessionDidFinish(*session); });
    drain();

    EXPECT_EQ(posts(), 1U);
}

} // namespace
