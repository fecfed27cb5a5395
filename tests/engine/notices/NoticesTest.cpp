// What the engine tells a person on the desktop, and when it does not.

#include <algorithm>
#include <filesystem>
#include <fstream>

#include <unistd.h>

#include "services/engine/Names.h"
#include "tests/engine/EngineFixture.h"
#include "tests/engine/notices/NotificationService.h"

namespace {

using namespace quorl;
using namespace quorl::syncd::testing;
using Kind = Event::Kind;
using ::testing::ElementsAre;
using ::testing::HasSubstr;
using ::testing::IsEmpty;

/// A client that says whether a person sees how the engine does.
class Watcher {
  public:
    void call(const char* method) {
        engine_->callMethod(method).onInterface(engine::engineInterface);
    }

    /// Waits until the bus has noticed that this has gone, and has told others.
    void die() {
        const auto name = connection_->getUniqueName();
        engine_.reset();
        connection_ = sdbus::createSessionBusConnection();
        const auto bus =
            sdbus::createProxy(*connection_, "org.freedesktop.DBus", "/org/freedesktop/DBus");
        for (bool isThere = true; isThere;) {
            bus->callMethod("NameHasOwner")
                .onInterface("org.freedesktop.DBus")
                .withArguments(name)
                .storeResultsTo(isThere);
        }
    }

  private:
    std::unique_ptr<sdbus::IConnection> connection_ = sdbus::createSessionBusConnection();
    std::unique_ptr<sdbus::IProxy> engine_ =
        sdbus::createProxy(*connection_, engine::busName, engine::enginePath);
};

class Notices : public EngineTest {
  protected:
    Notices() {
        music_.write("a.mp3", "a");
        music_.list({"a.mp3"});
    }

    /// Puts a file where the wearable keeps its music, which only a person takes away.
    void obstruct(const std::filesystem::path& wearable) {
        std::filesystem::create_directories(wearable);
        std::filesystem::remove_all(wearable / "Music");
        std::ofstream(wearable / "Music") << "in the way";
    }

    void clear() {
        std::filesystem::remove(wearable_ / "Music");
        sync();
    }

    /// Waits for the end of a session that is asked for.
    Event sync() {
        recorder_.client().startNow();
        return sessionEnd();
    }

    void startObstructed() {
        obstruct(wearable_);
        start();
        choose();
        ASSERT_FALSE(sessionEnd().success);
    }
};

TEST_F(Notices, ThatASyncHasFailedIsToldOnceAndWithdrawnWhenItIsMended) {
    NotificationService service;
    startObstructed();
    service.awaitCall("show 1");
    EXPECT_EQ(service.shown().title, "Music not synced");
    EXPECT_THAT(service.shown().body, HasSubstr("“Music” or “.quorl” is not a directory"));
    EXPECT_FALSE(sync().success);

    clear();

    service.awaitCall("close 1");
    EXPECT_THAT(service.calls(), ElementsAre("ask", "show 1", "close 1"));
}

TEST_F(Notices, AreWithdrawnWhenTheEngineEnds) {
    NotificationService service;
    startObstructed();
    service.awaitCall("show 1");
    service.awaitHeard(engine::busName);
    EXPECT_EQ(end(), 0);
    service.awaitCall("close 1");
}

TEST_F(Notices, AreNotShownWhileSomebodyWatches) {
    NotificationService service;
    obstruct(wearable_);
    start();
    Watcher watcher;
    watcher.call("Watch");
    watcher.call("Watch");
    watcher.call("Unwatch");
    choose();
    EXPECT_FALSE(sessionEnd().success);
    watcher.call("Unwatch");
    watcher.call("Unwatch");
    service.awaitHeard(engine::busName);
    EXPECT_THAT(service.calls(), IsEmpty());

    clear();
    obstruct(wearable_);
    EXPECT_FALSE(sync().success);

    service.awaitCall("show 1");
    watcher.call("Watch");
    service.awaitCall("close 1");
}

TEST_F(Notices, AreShownAgainWhenTheWatcherHasDied) {
    NotificationService service;
    obstruct(wearable_);
    start();
    Watcher watcher;
    watcher.call("Watch");
    choose();
    EXPECT_FALSE(sessionEnd().success);
    watcher.die();
    clear();
    obstruct(wearable_);
    EXPECT_FALSE(sync().success);
    service.awaitCall("show 1");
}

TEST_F(Notices, CanBeSwitchedOffAtAnyTime) {
    NotificationService service;
    startObstructed();
    service.awaitCall("show 1");

    set(preferences::desktopNotices, false);

    service.awaitCall("close 1");
    clear();
    obstruct(wearable_);
    EXPECT_FALSE(sync().success);
    service.awaitHeard(engine::busName);
    EXPECT_THAT(service.calls(), ElementsAre("ask", "show 1", "close 1"));

    set(preferences::desktopNotices, true);
    while (service.calls().size() < 4) { // as long as the engine has not heard of it
        clear();
        obstruct(wearable_);
        EXPECT_FALSE(sync().success);
    }
    service.awaitCall("show 2");
}

TEST_F(Notices, NeedNoServiceAndSaySoOnce) {
    startObstructed();
    clear();
    obstruct(wearable_);
    EXPECT_FALSE(sync().success);
    clear();
    EXPECT_EQ(end(), 0);
    const auto said = engine_->rest();
    EXPECT_THAT(said, HasSubstr("quorl-syncd: Nothing can be told on the desktop ("));
    EXPECT_EQ(std::ranges::count(said, '\n'), 1) << said;
}

TEST_F(Notices, KeepNoEngineFromEndingWhereTheServiceIsSilent) {
    NotificationService service;
    service.behave(NotificationService::Manner::KeepsSilent);
    startObstructed();
    service.awaitCall("ask");
    clear();
    recorder_.awaitStatus("Everything is up to date.");
    EXPECT_EQ(end(), 0);
}

TEST_F(Notices, AreNotForATrial) {
    int ends[2] = {};
    ASSERT_EQ(pipe(ends), 0);
    dup2(ends[0], STDIN_FILENO); // whose end is that of the trial
    NotificationService service;
    obstruct(std::filesystem::path(std::getenv("XDG_DATA_HOME")) / "quorl/trial-wearable");
    const Process engine({ENGINE_PROGRAM, "--trial", "--music-folder", music_.path()});
    Recorder recorder(engine::trialBusName);
    recorder.next(Kind::EngineDidAppear);
    const auto opened = preferences::SharedPreferences::open({}, base::Purpose::Trial);
    ASSERT_EQ(opened.preferences->set(preferences::assetSyncEnabled, true).problem, "");
    ASSERT_EQ(
        opened.preferences->set(preferences::assetSyncPlaylistPersistentID, idOf("List")).problem,
        "");
    EXPECT_FALSE(recorder.next(Kind::SessionDidFinish).success);
    service.awaitHeard(engine::trialBusName);
    EXPECT_THAT(service.calls(), IsEmpty());
}

} // namespace
