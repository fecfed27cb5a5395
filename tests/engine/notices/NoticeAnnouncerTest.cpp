// What of an engine's syncs comes to the desktop, in a time that passes only where a test lets it.

#include "quorl-syncd/notices/NoticeAnnouncer.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "services/engine/Codes.h"
#include "services/engine/Names.h"

namespace {

using namespace quorl::syncd;
using namespace std::chrono_literals;
using ::testing::ElementsAre;
using ::testing::IsEmpty;

namespace engine = quorl::engine;
namespace code = engine::code;

struct HandClock final : Clock {
    [[nodiscard]] TimePoint now() const override { return time; }

    TimePoint time = TimePoint(1h);
};

struct NotedBoard final : NoticeBoard {
    void show(const DesktopNotice& notice) override { noted.push_back(notice.message.code); }

    void withdraw() override { noted.emplace_back("withdrawn"); }

    std::vector<std::string> noted;
};

/// Clients who note what they are told.
struct NotedClients final : Announcer {
    struct Report final : SessionReport {
        explicit Report(std::vector<std::string>& all) : told(all) {}

        ~Report() override { told.emplace_back("gone"); }

        Report(const Report&) = delete;
        Report& operator=(const Report&) = delete;

        void copied(const CopyProgress& /*progress*/) override { told.emplace_back("copied"); }

        void finish(bool /*success*/, const std::string& message) override {
            told.push_back(message);
        }

        std::vector<std::string>& told;
    };

    void stateDidChange() override { told.emplace_back("state"); }

    [[nodiscard]] std::unique_ptr<SessionReport>
    beginSession(std::uint64_t /*number*/, std::function<void()> /*cancel*/) override {
        return std::make_unique<Report>(told);
    }

    std::vector<std::string> told;
};

class Announced : public ::testing::Test {
  protected:
    Announced() {
        status_.lastTime = 1;
        announcer_.follow([this]() -> const engine::EngineStatus& { return status_; });
    }

    void begin() {
        session_ = announcer_.beginSession(1, [] {});
        status_.syncState = engine::syncSyncing;
        announcer_.stateDidChange();
    }

    void bringSongs() {
        session_->copied({.bytes = 10});
        session_->copied({.bytes = 11});
    }

    void end(bool success, const char* result) {
        status_.lastCode = result;
        ++status_.lastTime;
        session_->finish(success, "end");
        session_.reset();
        status_.syncState = success ? engine::syncSynced : engine::syncPending;
        announcer_.stateDidChange();
    }

    engine::EngineStatus status_;
    NotedClients clients_;
    HandClock clock_;
    NotedBoard board_;
    NoticeAnnouncer announcer_{clients_, clock_, board_};
    std::unique_ptr<SessionReport> session_;
};

TEST_F(Announced, LongSyncIsTold) {
    begin();
    bringSongs();
    clock_.time += longSync;
    end(true, code::synced);
    EXPECT_THAT(board_.noted, ElementsAre(code::synced));
}

TEST_F(Announced, LongSyncThatFindsEverythingThereIsNotTold) {
    begin();
    session_->copied({.bytes = 10});
    session_->copied({.bytes = 10});
    clock_.time += longSync;
    end(true, code::synced);
    EXPECT_THAT(board_.noted, IsEmpty());
}

TEST_F(Announced, ShortSyncAfterALongOneIsNotTold) {
    begin();
    bringSongs();
    clock_.time += longSync;
    end(true, code::synced);
    begin();
    bringSongs();
    end(true, code::synced);
    EXPECT_THAT(board_.noted, ElementsAre(code::synced, "withdrawn"));
}

TEST_F(Announced, FailureIsToldOnceAndWithdrawnWhenItIsMended) {
    for (int tries = 0; tries < 3; ++tries) {
        begin();
        end(false, code::wearableFull);
    }
    EXPECT_THAT(board_.noted, ElementsAre(code::wearableFull));

    begin();
    end(true, code::synced);
    EXPECT_THAT(board_.noted, ElementsAre(code::wearableFull, "withdrawn"));
}

TEST_F(Announced, WearableThatIsBackIsNoticedInTheMiddleOfASync) {
    begin();
    bringSongs();
    end(false, code::wentAway);
    begin();
    EXPECT_THAT(board_.noted, ElementsAre(code::wentAway));
    bringSongs();
    EXPECT_THAT(board_.noted, ElementsAre(code::wentAway, "withdrawn"));
}

TEST_F(Announced, NothingIsToldOfWhatIsOnTheScreen) {
    announcer_.setWatched(true);
    begin();
    end(false, code::wearableFull);
    announcer_.setWatched(false);
    EXPECT_THAT(board_.noted, IsEmpty());
}

TEST_F(Announced, NoticeIsWithdrawnWhenItComesOnTheScreen) {
    begin();
    end(false, code::wearableFull);
    announcer_.setWatched(true);
    announcer_.setWatched(false);
    EXPECT_THAT(board_.noted, ElementsAre(code::wearableFull, "withdrawn"));
}

TEST_F(Announced, NothingIsToldWhereNobodyWantsIt) {
    begin();
    end(false, code::wearableFull);
    announcer_.setWanted(false);
    begin();
    end(false, code::writeProtected);
    EXPECT_THAT(board_.noted, ElementsAre(code::wearableFull, "withdrawn"));
}

TEST_F(Announced, ClientsAreToldEverything) {
    begin();
    bringSongs();
    end(true, code::synced);
    EXPECT_THAT(clients_.told, ElementsAre("state", "copied", "copied", "end", "gone", "state"));
}

TEST(NotAnnounced, NothingIsToldOfAnEngineThatIsNotFollowed) {
    NotedClients clients;
    const HandClock clock;
    NotedBoard board;
    NoticeAnnouncer announcer(clients, clock, board);
    announcer.stateDidChange();
    announcer.setWatched(true);
    EXPECT_THAT(clients.told, ElementsAre("state"));
    EXPECT_THAT(board.noted, IsEmpty());
}

} // namespace
