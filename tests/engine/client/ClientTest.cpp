// The connection of an app to the engine.

#include <csignal>
#include <fstream>
#include <set>
#include <thread>

#include <sdbus-c++/sdbus-c++.h>

#include "tests/engine/EngineFixture.h"
#include "tests/engine/client/WatchedEngine.h"

namespace {

using namespace quorl;
using namespace quorl::syncd::testing;
using Kind = Event::Kind;
using ::testing::HasSubstr;

class Client : public EngineTest {};

TEST_F(Client, IsCalmWhereThereIsNoEngine) {
    recorder_.next(Kind::EngineDidVanish);

    EXPECT_FALSE(recorder_.state().isThere);
    EXPECT_NE(recorder_.ask(&engine::Client::startNow), "") << "a request says why it failed";
}

TEST_F(Client, StartsTheEngineWhereItCanBeStarted) {
    recorder_.next(Kind::EngineDidVanish);
    const std::filesystem::path data{std::getenv("XDG_DATA_HOME")};
    std::ofstream{data / "dbus-1/services/engine.service"}
        << "[D-BUS Service]\nName=" << engine::busName << "\nExec=" << ENGINE_PROGRAM << "\n";
    const auto connection = sdbus::createSessionBusConnection();
    sdbus::createProxy(*connection, "org.freedesktop.DBus", "/org/freedesktop/DBus")
        ->callMethod("ReloadConfig")
        .onInterface("org.freedesktop.DBus");

    Recorder second;

    second.next(Kind::EngineDidAppear);
    EXPECT_EQ(second.state().wearable.name, "Velora");
    recorder_.next(Kind::EngineDidAppear);
}

TEST_F(Client, FindsTheEngineAgainAfterItWasKilledAndRestarted) {
    listLargeSongs();
    start({"--rate-limit", "1000000"});
    choose();
    nextOfAssets(Kind::TaskDidUpdate);
    ASSERT_EQ(recorder_.state().sessions.size(), 1);

    end(SIGKILL);
    EXPECT_TRUE(recorder_.state().sessions.empty());
    start();

    EXPECT_TRUE(sessionEnd().success);
}

TEST_F(Client, ThatComesInTheMiddleOfASessionSeesAllOfIt) {
    listLargeSongs();
    start({"--rate-limit", "1000000"});
    choose();
    nextOfAssets(Kind::TaskDidUpdate);

    Recorder late;
    late.next(Kind::EngineDidAppear);

    const auto state = late.state();
    ASSERT_EQ(state.sessions.size(), 1);
    ASSERT_EQ(state.sessions.front().tasks.size(), 2);
    EXPECT_EQ(state.sessions.front().tasks.back().groupingKey, engine::assetGroupingKey);
    EXPECT_TRUE(state.sessions.front().tasks.back().isRunning);
    late.next(Kind::TaskDidUpdate);
    EXPECT_TRUE(late.next(Kind::SessionDidFinish).success);
}

TEST_F(Client, MakesEveryReplyExactlyOnceAlsoWhenItIsDestroyedBefore) {
    start();
    std::atomic<int> replies = 0;
    {
        Recorder brief;
        for (int request = 0; request < 50; ++request) {
            brief.client().refreshWearable([&](const std::string&) { ++replies; });
        }
    }
    EXPECT_EQ(replies, 50);
}

TEST_F(Client, SendsTheLastOfManySettingsAndAnswersThemAllAlsoWhenItIsDestroyed) {
    start();
    std::atomic<int> replies = 0;
    {
        Recorder brief;
        for (int request = 1; request <= 500; ++request) {
            brief.client().setRateLimit(static_cast<std::uint64_t>(request),
                                        [&](const std::string&) { ++replies; });
        }
    }
    EXPECT_EQ(replies, 500);
    for (int request = 0; request < 500; ++request) {
        recorder_.client().setRateLimit(static_cast<std::uint64_t>(request));
    }
    EXPECT_EQ(recorder_.ask(&engine::Client::setRateLimit, 7), "");
    recorder_.awaitState([](const auto& state) { return state.engine.rateLimit == 7; });
    std::set<std::uint64_t> seen;
    for (const auto& event : recorder_.all()) {
        seen.insert(event.state->engine.rateLimit);
    }
    EXPECT_LT(seen.size(), 100) << "a value for each turn of the bus, not for each wish";
}

/// An engine that does not stop talking.
class TalkativeEngine {
  public:
    TalkativeEngine() {
        bus_->requestName(engine::busName);
        thread_ = std::jthread([this](const std::stop_token& stop) {
            while (!stop.stop_requested()) {
                object_->emitSignal("Noise").onInterface("org.quorl.Velora.Sync.Engine");
            }
        });
    }

  private:
    std::unique_ptr<sdbus::IConnection> bus_ = sdbus::createSessionBusConnection();
    std::unique_ptr<sdbus::IObject> object_ = sdbus::createObject(*bus_, engine::enginePath);
    std::jthread thread_;
};

TEST_F(Client, SaysToEachEngineThatAPersonWatches) {
    engine::Client client([](const engine::Event&) {});
    client.setWatching(true);
    client.setWatching(true);
    {
        WatchedEngine first;
        EXPECT_EQ(first.nextCall(), "Watch");
    }
    WatchedEngine second;
    EXPECT_EQ(second.nextCall(), "Watch");
    client.setWatching(false);
    EXPECT_EQ(second.nextCall(), "Unwatch");
}

TEST_F(Client, LeavesAnEngineThatDoesNotStopTalking) {
    const TalkativeEngine engine;
    std::atomic<int> replies = 0;
    {
        Recorder brief;
        brief.client().setRateLimit(1, [&](const std::string&) { ++replies; });
    }
    EXPECT_EQ(replies, 1);
}

TEST_F(Client, SaysThatTheBusIsGoneAndStillAnswers) {
    SecondBus bus;
    const std::string own = std::getenv("DBUS_SESSION_BUS_ADDRESS");
    setenv("DBUS_SESSION_BUS_ADDRESS", bus.address().c_str(), 1);
    Recorder recorder;
    setenv("DBUS_SESSION_BUS_ADDRESS", own.c_str(), 1);
    recorder.next(Kind::EngineDidVanish);

    bus.kill();

    EXPECT_THAT(recorder.next(Kind::BusDidVanish).message, HasSubstr("session bus is gone"));
    EXPECT_THAT(recorder.ask(&engine::Client::startNow), HasSubstr("session bus is gone"));
}

TEST_F(Client, SaysSoWhereThereIsNoBusAtAll) {
    const std::string own = std::getenv("DBUS_SESSION_BUS_ADDRESS");
    setenv("DBUS_SESSION_BUS_ADDRESS", "unix:path=/nowhere", 1);
    Recorder recorder;
    setenv("DBUS_SESSION_BUS_ADDRESS", own.c_str(), 1);

    recorder.next(Kind::BusDidVanish);
    EXPECT_NE(recorder.ask(&engine::Client::cancel), "");
}

} // namespace
