// The engine without a bus, a device or a thread: everything that it touches is
// made of values, and time passes only where a test lets it.

#include <map>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "quorl-syncd/engine/Engine.h"

namespace {

using namespace quorl;
using namespace quorl::syncd;
using namespace std::chrono_literals;
using ::testing::ElementsAre;
using ::testing::IsEmpty;

class ManualTurns final : public Turns {
  public:
    [[nodiscard]] TimePoint now() const override { return now_; }

    void callAt(TimePoint time, Work work) override { timers_.emplace(time, std::move(work)); }

    [[nodiscard]] std::uint64_t calendarTime() const override { return 17; }

    /// Lets time pass, and calls what becomes due.
    void pass(Clock::TimePoint::duration time) {
        const auto end = now_ + time;
        while (!timers_.empty() && timers_.begin()->first <= end) {
            auto next = timers_.extract(timers_.begin());
            now_ = std::max(now_, next.key());
            next.mapped()();
        }
        now_ = end;
    }

  private:
    TimePoint now_ = TimePoint(1h);
    std::multimap<TimePoint, Work> timers_;
};

struct FixedChoices final : ChoiceStore {
    [[nodiscard]] Choices read() override { return choices; }

    [[nodiscard]] std::string rememberSent(const SentPlaylist& sent) override {
        if (problem.empty()) {
            choices.lastSent = sent;
            remembered.push_back(sent);
        }
        return problem;
    }

    [[nodiscard]] std::string forgetSent() override {
        if (problem.empty()) {
            choices.lastSent.reset();
        }
        return problem;
    }

    [[nodiscard]] std::string switchOff() override {
        choices.isSyncEnabled = choices.isSyncEnabled && !problem.empty();
        return problem;
    }

    Choices choices;
    std::vector<SentPlaylist> remembered;
    std::string problem;
};

struct FixedMusic final : MusicPort {
    struct Folder final : WatchedMusic {
        explicit Folder(int& count) : rescans_(count) {}

        void rescan() override { ++rescans_; }

        int& rescans_;
    };

    [[nodiscard]] std::string usualFolder() override { return "/home/Music"; }

    [[nodiscard]] std::unique_ptr<WatchedMusic> watch(const std::string& /*folder*/,
                                                      Changed told) override {
        if (isExhausted) {
            throw std::system_error(EMFILE, std::generic_category());
        }
        changed = std::move(told);
        return std::make_unique<Folder>(rescans);
    }

    bool isExhausted = false;
    Changed changed;
    int rescans = 0;
};

struct FixedWearables final : WearablePort {
    struct Watched final : WatchedWearable {
        Watched(FixedWearables& port, wearable::Wearable what)
            : port_(port), what_(std::move(what)) {}

        [[nodiscard]] wearable::Wearable identity() const override { return what_; }

        void look(Reply reply) override { port_.replies.push_back(std::move(reply)); }

        void save(const wearable::AttachmentChange& change, Saved saved) override {
            port_.saves.push_back({change.appliedTo(port_.attachment), std::move(saved)});
        }

        FixedWearables& port_;
        const wearable::Wearable what_;
    };

    [[nodiscard]] std::unique_ptr<WatchedWearable> watch(const std::string& directory,
                                                         Noticed told) override {
        if (isExhausted) {
            throw std::system_error(EAGAIN, std::generic_category());
        }
        replies.clear();
        noticed = std::move(told);
        const auto capacity = directory.empty() ? std::optional(std::uint64_t{100}) : std::nullopt;
        identity = {directory.empty() ? "/embedded" : directory, capacity, false};
        return std::make_unique<Watched>(*this, identity);
    }

    void answer(const WatchedWearable::Answer& answer) {
        for (const auto& reply : std::exchange(replies, {})) {
            reply(answer);
        }
    }

    void answer(const wearable::Usage& usage) { answer(Sight{identity, usage, attachment}); }

    void answer(const char* problem) { answer(wearable::Unseen{engine::other(problem)}); }

    /// It hangs.
    void beSilent() { answer(wearable::Unseen{engine::other("It does not answer."), true}); }

    void notice(WearableNews news) const {
        const auto call = noticed;
        call(news);
    }

    /// The oldest save has ended.
    void saveOne(const std::string& problem = {}) {
        const auto save = saves.front();
        saves.erase(saves.begin());
        attachment = problem.empty() ? save.attachment : attachment;
        save.saved(problem);
    }

    struct Save {
        wearable::Attachment attachment;
        WatchedWearable::Saved saved;
    };

    wearable::Wearable identity;
    bool isExhausted = false;
    wearable::Attachment attachment;
    std::vector<Save> saves;
    std::vector<WatchedWearable::Reply> replies;
    Noticed noticed;
};

struct ManualSyncs final : SyncRunner {
    struct Running final : RunningSync {
        explicit Running(bool& flag) : flag_(flag) {}

        void stop() override { flag_ = true; }

        bool& flag_;
    };

    [[nodiscard]] std::unique_ptr<RunningSync> begin(const Order& order, Copied told,
                                                     Ended then) override {
        orders.push_back(order);
        copied = std::move(told);
        ended = std::move(then);
        isStopped = false;
        return std::make_unique<Running>(isStopped);
    }

    void setRateLimit(std::uint64_t bytesPerSecond) override { rate = bytesPerSecond; }

    /// The call destroys the sync, not what the test has given to it.
    void end(const Outcome& outcome) const {
        const auto call = ended;
        call(outcome);
    }

    std::vector<Order> orders;
    Copied copied;
    Ended ended;
    bool isStopped = false;
    std::uint64_t rate = 0;
};

struct ResultsInMemory final : ResultStore {
    [[nodiscard]] LastResult of(const std::string& wearable) const override {
        const auto found = results.find(wearable);
        return found == results.end() ? LastResult() : found->second;
    }

    void remember(const std::string& wearable, LastResult result) override {
        results[wearable] = std::move(result);
    }

    std::map<std::string, LastResult> results;
};

struct Sessions final : Announcer {
    struct Report final : SessionReport {
        explicit Report(std::vector<std::string>& lines) : lines_(lines) {}

        void copied(const CopyProgress& /*progress*/) override {}

        void finish(bool success, const std::string& message) override {
            lines_.push_back((success ? "+ " : "- ") + message);
        }

        std::vector<std::string>& lines_;
    };

    void stateDidChange() override {}

    [[nodiscard]] std::unique_ptr<SessionReport> beginSession(std::uint64_t /*number*/,
                                                              std::function<void()> ask) override {
        cancel = std::move(ask);
        return std::make_unique<Report>(ends);
    }

    std::function<void()> cancel;
    std::vector<std::string> ends;
};

const Outcome sent{Outcome::Kind::Sent, engine::other("All sent."), false, false};
const Outcome full{Outcome::Kind::Failed, engine::other("It is full."), false, true};
const Outcome stopped{Outcome::Kind::Stopped, {}, false, false};
const auto upToDate = "Everything is up to date.";

class EngineInTurns : public ::testing::Test {
  protected:
    EngineInTurns() { choices_.choices = {true, 7, 1, 250, {}}; }

    void start() {
        engine_.emplace(EnginePorts{turns_, choices_, music_, wearables_, syncs_, results_, bus_},
                        EngineSettings{{}, {}, 5, 60s});
    }

    void readMusic(std::uint64_t revision) {
        auto inventory = std::make_shared<media::Inventory>();
        inventory->playlists.push_back({7, revision, "List", "List.m3u8", false, {}, {}});
        music_.changed(std::move(inventory));
    }

    /// Everything is there, and a sync of the playlist has begun.
    void startSyncing() {
        start();
        readMusic(3);
        wearables_.answer(wearable::Usage{});
    }

    [[nodiscard]] std::string status() const { return engine_->status().status; }

    /// The wearable has what was ordered last.
    void answerAsSent() {
        wearables_.answer(wearable::Usage{100, 50, 50, 1, syncs_.orders.back().selection});
    }

    ManualTurns turns_;
    FixedChoices choices_;
    FixedMusic music_;
    FixedWearables wearables_;
    ManualSyncs syncs_;
    ResultsInMemory results_;
    Sessions bus_;
    std::optional<Engine> engine_;
};

TEST_F(EngineInTurns, BeginsOnceMusicAndWearableAreKnownAndRemembersWhatItHasSent) {
    start();
    EXPECT_EQ(status(), "Reading the music folder…");
    readMusic(3);
    EXPECT_EQ(status(), "Looking for the wearable…");
    EXPECT_THAT(syncs_.orders, IsEmpty());

    wearables_.answer(wearable::Usage{});
    ASSERT_EQ(syncs_.orders.size(), 1);
    EXPECT_EQ(syncs_.orders[0].selection, (wearable::Selection{7, 3, 1, 250}));
    EXPECT_EQ(status(), "Syncing music.");
    syncs_.end(sent);

    EXPECT_EQ(choices_.choices.lastSent, (SentPlaylist{7, 3}));
    EXPECT_THAT(bus_.ends, ElementsAre("+ All sent."));
    EXPECT_EQ(results_.of("/embedded"), (LastResult{true, engine::other("All sent."), 17, 17}));
    EXPECT_EQ(status(), upToDate);
    answerAsSent();
    EXPECT_EQ(syncs_.orders.size(), 1);
}

TEST_F(EngineInTurns, SaysThatASyncIsBeingEnded) {
    startSyncing();
    engine_->cancel();
    EXPECT_EQ(status(), "Ending the sync. The sync was cancelled.");
    EXPECT_EQ(engine_->status().syncState, "syncing");

    syncs_.end(stopped);

    EXPECT_EQ(status(), "The sync was cancelled.");
    EXPECT_EQ(engine_->status().syncState, "pending");
}

TEST_F(EngineInTurns, BringsAgainWhatIsLostAfterACancelThatCameTooLate) {
    startSyncing();
    engine_->cancel();
    syncs_.end(sent);
    answerAsSent();
    EXPECT_EQ(status(), upToDate);

    wearables_.notice(WearableNews::MayHaveChanged);
    wearables_.answer(wearable::Usage{});

    EXPECT_EQ(syncs_.orders.size(), 2);
}

const Outcome removed{Outcome::Kind::Sent, {"removed"}, false, false};

TEST_F(EngineInTurns, RemovesTheMusicOnceTheSyncThatIsUnderWayHasEnded) {
    startSyncing();
    engine_->removeMusic();
    EXPECT_TRUE(syncs_.isStopped);
    EXPECT_FALSE(choices_.choices.isSyncEnabled);
    EXPECT_EQ(syncs_.orders.size(), 1);

    syncs_.end(stopped);
    ASSERT_EQ(syncs_.orders.size(), 2);
    EXPECT_TRUE(syncs_.orders.back().isRemoval());
    EXPECT_EQ(status(), "Removing the music.");
    wearables_.answer(wearable::Usage{});
    EXPECT_FALSE(syncs_.isStopped);
    syncs_.end(removed);

    EXPECT_THAT(bus_.ends, ElementsAre("- Music sync is switched off.",
                                       "+ The music was removed from the Velora."));
    EXPECT_EQ(choices_.choices.lastSent, std::nullopt);
    EXPECT_EQ(engine_->status().lastComplete, 0);
    EXPECT_EQ(status(), "Music sync is switched off.");
    wearables_.answer(wearable::Usage{});
    EXPECT_EQ(syncs_.orders.size(), 2);
}

TEST_F(EngineInTurns, RemovesNothingWhereTheWearableIsAwayOrSyncStaysOn) {
    start();
    EXPECT_THROW(engine_->removeMusic(), NotReady);
    EXPECT_TRUE(choices_.choices.isSyncEnabled);
    wearables_.answer(wearable::Usage{});
    choices_.problem = "No store.";

    EXPECT_THROW(engine_->removeMusic(), NotReady);

    EXPECT_THAT(syncs_.orders, IsEmpty());
}

TEST_F(EngineInTurns, StopsRemovingWhereItIsCancelledOrSomethingIsChosen) {
    start();
    wearables_.answer(wearable::Usage{});
    engine_->removeMusic();
    engine_->cancel();
    syncs_.end(stopped);
    EXPECT_EQ(syncs_.orders.size(), 1) << "it was cancelled";

    engine_->removeMusic();
    choices_.choices.isSyncEnabled = true;
    readMusic(3);
    engine_->choicesDidChange();

    EXPECT_TRUE(syncs_.isStopped);
    syncs_.end(stopped);
    turns_.pass(200ms);
    ASSERT_EQ(syncs_.orders.size(), 3);
    EXPECT_FALSE(syncs_.orders.back().isRemoval());
}

TEST_F(EngineInTurns, DoesNotRemoveFromAWearableThatWentAwayMeanwhile) {
    startSyncing();
    engine_->removeMusic();
    wearables_.notice(WearableNews::MayBeAnother);
    wearables_.answer("It is away.");
    syncs_.end(stopped);
    EXPECT_EQ(syncs_.orders.size(), 1);

    wearables_.answer(wearable::Usage{});

    EXPECT_EQ(syncs_.orders.size(), 1);
}

TEST_F(EngineInTurns, RemembersWhenAllWasLastSent) {
    startSyncing();
    syncs_.end(sent);
    engine_->startNow();
    syncs_.end(full);

    EXPECT_EQ(results_.of("/embedded").lastComplete, 17);
    EXPECT_EQ(engine_->status().lastComplete, 17);
    EXPECT_FALSE(engine_->status().lastSuccess);
}

TEST_F(EngineInTurns, TellsWhatOfThePlaylistCannotBeSent) {
    auto inventory = std::make_shared<media::Inventory>();
    inventory->playlists.push_back({7, 3, "List", "List.m3u8", false, {}, {}});
    inventory->leftOut = {{"List.m3u8", "gone.mp3", media::Reason::Missing}};
    start();
    music_.changed(inventory);
    wearables_.answer(wearable::Usage{});
    EXPECT_EQ(engine_->status().leftOutCount, 1);

    const Outcome left{Outcome::Kind::Failed, {}, true, true, {{"song-changed", {"new.mp3"}}}};
    syncs_.end(left);
    EXPECT_THAT(engine_->status().leftOut,
                ElementsAre(engine::LeftOutItem("new.mp3", "song-changed"),
                            engine::LeftOutItem("gone.mp3", "missing")));
    turns_.pass(60s);
    syncs_.end(sent);

    EXPECT_EQ(engine_->status().leftOutCount, 1) << "the other one was sent this time";
    EXPECT_EQ(status(), "Everything that could be found is on the Velora. 1 song could not be "
                        "found or read.");
    choices_.choices.isSyncEnabled = false;
    engine_->choicesDidChange();
    EXPECT_EQ(engine_->status().leftOutCount, 0);
}

TEST_F(EngineInTurns, WaitsUntilTheChoicesStayAsTheyAre) {
    startSyncing();
    syncs_.end(sent);
    answerAsSent();
    choices_.choices.limit = 100;
    engine_->choicesDidChange();
    turns_.pass(150ms);
    choices_.choices.limit = 50;
    engine_->choicesDidChange();

    turns_.pass(199ms);
    EXPECT_EQ(syncs_.orders.size(), 1);
    turns_.pass(1ms);

    ASSERT_EQ(syncs_.orders.size(), 2);
    EXPECT_EQ(syncs_.orders[1].selection.limit, 50);
}

TEST_F(EngineInTurns, TriesAgainLaterAndLater) {
    startSyncing();
    syncs_.end(full);
    EXPECT_EQ(status(), "It is full.");

    turns_.pass(59s);
    EXPECT_EQ(syncs_.orders.size(), 1);
    turns_.pass(1s);
    ASSERT_EQ(syncs_.orders.size(), 2);
    syncs_.end(full);
    turns_.pass(119s);
    EXPECT_EQ(syncs_.orders.size(), 2);
    turns_.pass(1s);

    EXPECT_EQ(syncs_.orders.size(), 3);
}

TEST_F(EngineInTurns, DoesNotTryAgainWhatWasCancelledUntilTheWearableIsBack) {
    startSyncing();
    bus_.cancel();
    EXPECT_TRUE(syncs_.isStopped);
    syncs_.end(stopped);
    EXPECT_THAT(bus_.ends, ElementsAre("- The sync was cancelled."));
    turns_.pass(24h);
    EXPECT_EQ(syncs_.orders.size(), 1);

    wearables_.answer("It went away.");
    engine_->refreshWearable();
    wearables_.answer(wearable::Usage{});

    EXPECT_EQ(syncs_.orders.size(), 2);
}

TEST_F(EngineInTurns, SendsTheNextRevisionAfterTheOneThatIsUnderWay) {
    startSyncing();
    readMusic(4);
    EXPECT_FALSE(syncs_.isStopped);

    syncs_.end(sent);

    EXPECT_THAT(choices_.remembered, ElementsAre(SentPlaylist{7, 3}));
    EXPECT_EQ(choices_.choices.lastSent, std::nullopt) << "the next one is on its way";
    ASSERT_EQ(syncs_.orders.size(), 2);
    EXPECT_EQ(syncs_.orders[1].selection.revision, 4);
}

TEST_F(EngineInTurns, ForgetsWhatWasSentBeforeASyncChangesIt) {
    choices_.choices.lastSent = SentPlaylist{7, 2};
    start();
    readMusic(3);
    EXPECT_EQ(choices_.choices.lastSent, (SentPlaylist{7, 2})) << "nothing is known yet";

    wearables_.answer(wearable::Usage{100, 50, 50, 1, wearable::Selection{7, 2, 1, 250}});

    ASSERT_EQ(syncs_.orders.size(), 1);
    EXPECT_EQ(choices_.choices.lastSent, std::nullopt);
    syncs_.end(full);
    EXPECT_EQ(choices_.choices.lastSent, std::nullopt);
}

TEST_F(EngineInTurns, ForgetsWhatAnotherWearableDoesNotHave) {
    startSyncing();
    syncs_.end(sent);
    answerAsSent();
    choices_.choices.isSyncEnabled = false;
    engine_->setWearableDirectory("/media/velora");
    EXPECT_EQ(choices_.choices.lastSent, (SentPlaylist{7, 3}));

    wearables_.answer(wearable::Usage{});

    EXPECT_EQ(choices_.choices.lastSent, std::nullopt);
    EXPECT_EQ(syncs_.orders.size(), 1);
}

TEST_F(EngineInTurns, DoesNotBeginWhereItCannotForgetWhatWasSent) {
    choices_.choices.lastSent = SentPlaylist{7, 2};
    choices_.problem = "The store is gone.";
    startSyncing();
    EXPECT_THAT(syncs_.orders, IsEmpty());
    EXPECT_EQ(status(), "The store is gone.");

    choices_.problem.clear();
    turns_.pass(60s);

    EXPECT_EQ(syncs_.orders.size(), 1);
}

TEST_F(EngineInTurns, TriesAgainWhereItCannotRememberThatAllWasSent) {
    startSyncing();
    choices_.problem = "The store is gone.";

    syncs_.end(sent);
    choices_.problem.clear();

    EXPECT_THAT(bus_.ends, ElementsAre("- The store is gone."));
    turns_.pass(60s);
    EXPECT_EQ(syncs_.orders.size(), 2);
}

TEST_F(EngineInTurns, HasTheMusicFolderReadAgainThatWasNotAsItWasThought) {
    startSyncing();
    syncs_.end({Outcome::Kind::Failed, engine::other("A song is gone."), true, false});

    EXPECT_EQ(music_.rescans, 1);
    turns_.pass(24h);
    EXPECT_EQ(syncs_.orders.size(), 1);
    readMusic(4);
    EXPECT_EQ(syncs_.orders.size(), 2);
}

TEST_F(EngineInTurns, TakesADirectoryForAnotherWearableOnceADeviceIsMountedThere) {
    startSyncing();
    engine_->setWearableDirectory("/media/velora");
    EXPECT_TRUE(syncs_.isStopped);
    EXPECT_EQ(syncs_.rate, 0) << "only the embedded one is slowed down";
    syncs_.end(stopped);
    EXPECT_THAT(bus_.ends, ElementsAre("- Something else was chosen."));
    wearables_.answer(wearable::Usage{});
    ASSERT_EQ(syncs_.orders.size(), 2);

    wearables_.identity.isMountPoint = true;
    wearables_.notice(WearableNews::MayBeAnother);
    EXPECT_FALSE(syncs_.isStopped) << "it is not known yet";
    wearables_.answer(wearable::Usage{});
    EXPECT_TRUE(syncs_.isStopped);
    syncs_.end(stopped);
    wearables_.answer(wearable::Usage{});

    ASSERT_EQ(syncs_.orders.size(), 3);
    EXPECT_TRUE(syncs_.orders[2].wearable.isMountPoint);
}

TEST_F(EngineInTurns, KnowsNothingOfAWearableThatMayBeAnother) {
    startSyncing();
    syncs_.end(sent);
    answerAsSent();
    EXPECT_EQ(engine_->status().syncState, "synced");

    engine_->refreshWearable();
    const auto before = std::exchange(wearables_.replies, {});
    wearables_.notice(WearableNews::MayBeAnother);
    EXPECT_EQ(engine_->status().syncState, "unknown");
    before.front()(Sight{
        wearables_.identity, wearable::Usage{100, 50, 50, 1, syncs_.orders.back().selection}, {}});
    EXPECT_EQ(engine_->status().syncState, "unknown") << "it was seen before";
    wearables_.answer(wearable::Usage{});

    EXPECT_EQ(choices_.choices.lastSent, std::nullopt);
    EXPECT_EQ(syncs_.orders.size(), 2);
}

TEST_F(EngineInTurns, DoesNotBeginAgainForWhatWasSeenBeforeTheEnd) {
    startSyncing();
    engine_->refreshWearable();
    const auto before = std::exchange(wearables_.replies, {});
    syncs_.end(sent);

    before.front()(Sight{wearables_.identity, {}, {}});

    EXPECT_EQ(syncs_.orders.size(), 1);
    EXPECT_EQ(choices_.choices.lastSent, (SentPlaylist{7, 3}));
}

TEST_F(EngineInTurns, NoticesSongsThatSomebodyHasRemovedFromTheWearable) {
    startSyncing();
    wearables_.notice(WearableNews::MayHaveChanged);
    EXPECT_THAT(wearables_.replies, IsEmpty()) << "the sync itself changes much";
    syncs_.end(sent);
    answerAsSent();

    wearables_.notice(WearableNews::MayHaveChanged);
    wearables_.answer(wearable::Usage{100, 60, 40, {}});

    EXPECT_EQ(choices_.choices.lastSent, std::nullopt);
    EXPECT_EQ(syncs_.orders.size(), 2);
}

TEST_F(EngineInTurns, LooksAgainWhenAChoiceIsMade) {
    startSyncing();
    syncs_.end(sent);
    answerAsSent();

    engine_->choicesDidChange();

    EXPECT_EQ(wearables_.replies.size(), 1);
}

TEST_F(EngineInTurns, SaysThatTheWearableDoesNotAnswerAndGivesUpASyncThatHangs) {
    startSyncing();
    turns_.pass(10s);
    wearables_.beSilent();
    EXPECT_EQ(status(), "Ending the sync. It does not answer.");
    EXPECT_TRUE(syncs_.isStopped);
    EXPECT_THAT(bus_.ends, IsEmpty()) << "it may still end in order";

    turns_.pass(10s);

    EXPECT_THAT(bus_.ends, ElementsAre("- It does not answer."));
    EXPECT_EQ(status(), "It does not answer.");
    turns_.pass(60s);
    wearables_.answer(wearable::Usage{});
    EXPECT_EQ(syncs_.orders.size(), 2) << "it is back";
}

TEST_F(EngineInTurns, LeavesASyncThatMovesAlone) {
    startSyncing();
    wearables_.replies.clear();
    for (int seconds = 0; seconds < 100; ++seconds) {
        turns_.pass(1s);
        syncs_.copied({});
    }
    EXPECT_THAT(wearables_.replies, IsEmpty());
}

TEST_F(EngineInTurns, SyncsToAnotherWearableThoughTheOneBeforeHangs) {
    startSyncing();
    engine_->setWearableDirectory("/media/velora");
    wearables_.answer(wearable::Usage{});
    EXPECT_EQ(syncs_.orders.size(), 1);

    turns_.pass(10s);

    ASSERT_EQ(syncs_.orders.size(), 2);
    EXPECT_EQ(syncs_.orders[1].wearable.root, "/media/velora");
}

TEST_F(EngineInTurns, SavesTheLastOfManySwitchesAndNoneThatIsAsItWas) {
    start();
    engine_->attach({.connected = {}, .onCharger = false});
    EXPECT_FALSE(engine_->attachment().onCharger) << "though it was not looked at yet";
    wearables_.attachment.connected = false;
    wearables_.answer(wearable::Usage{});
    EXPECT_EQ(engine_->attachment(), (wearable::Attachment{false, false}));
    ASSERT_EQ(wearables_.saves.size(), 1);

    for (int times = 0; times < 100; ++times) {
        engine_->attach({.connected = times % 2 == 0, .onCharger = {}});
    }
    EXPECT_EQ(wearables_.saves.size(), 1) << "one at a time";
    wearables_.saveOne();

    EXPECT_THAT(wearables_.saves, IsEmpty()) << "it is as it was";
    engine_->attach({.connected = true, .onCharger = true});
    engine_->attach({.connected = true, .onCharger = true});
    ASSERT_EQ(wearables_.saves.size(), 1);
    wearables_.saveOne();
    EXPECT_EQ(wearables_.attachment, wearable::Attachment());
    EXPECT_THAT(wearables_.saves, IsEmpty());
}

TEST_F(EngineInTurns, TakesASwitchBackThatCannotBeSaved) {
    startSyncing();
    engine_->attach({.connected = {}, .onCharger = false});
    EXPECT_FALSE(engine_->wearable().isOnCharger);

    wearables_.saveOne("It is write-protected.");

    EXPECT_TRUE(engine_->wearable().isOnCharger);
    EXPECT_THAT(wearables_.saves, IsEmpty());
}

TEST_F(EngineInTurns, SavesTheLastSwitchAlsoWhenItEndsBeforeTheOneBeforeIsSaved) {
    startSyncing();
    engine_->attach({.connected = {}, .onCharger = false});
    ASSERT_EQ(wearables_.saves.size(), 1);
    engine_->attach({.connected = {}, .onCharger = true});

    engine_.reset();

    ASSERT_EQ(wearables_.saves.size(), 2);
    EXPECT_TRUE(wearables_.saves.back().attachment.onCharger);
}

TEST_F(EngineInTurns, SavesASwitchAlsoWhenItEndsBeforeTheWearableWasSeen) {
    start();
    engine_->attach({.connected = {}, .onCharger = false});
    wearables_.attachment.connected = false;
    ASSERT_THAT(wearables_.saves, IsEmpty());

    engine_.reset();

    ASSERT_EQ(wearables_.saves.size(), 1);
    EXPECT_EQ(wearables_.saves.back().attachment, (wearable::Attachment{false, false}));
}

TEST_F(EngineInTurns, SavesNothingAtItsEndThatIsBeingSaved) {
    startSyncing();
    engine_->attach({.connected = {}, .onCharger = false});

    engine_.reset();

    EXPECT_EQ(wearables_.saves.size(), 1);
}

TEST_F(EngineInTurns, SaysWhyItCannotStartOrAttach) {
    start();
    EXPECT_THROW(engine_->startNow(), NotReady);
    engine_->setWearableDirectory("/media/velora");
    EXPECT_THROW(engine_->attach({true, false}), NotReady);
}

TEST_F(EngineInTurns, KeepsTheFoldersThatItHasWhereOthersCannotBeWatched) {
    startSyncing();
    wearables_.isExhausted = true;
    music_.isExhausted = true;

    EXPECT_THROW(engine_->setWearableDirectory("/media/velora"), NotReady);
    EXPECT_THROW(engine_->setMusicFolder("/srv/music"), NotReady);

    EXPECT_EQ(engine_->wearable().directory, "/embedded");
    EXPECT_EQ(engine_->status().musicFolder, "/home/Music");
    EXPECT_FALSE(syncs_.isStopped);
}

TEST_F(EngineInTurns, EndsTheSyncThatIsUnderWayWhenItEnds) {
    startSyncing();

    engine_.reset();

    EXPECT_THAT(bus_.ends, ElementsAre("- The sync engine was ended."));
    EXPECT_EQ(results_.of("/embedded").message, engine::Message{"ended"});
}

} // namespace
