// The connection of an app to the engine.

#include <csignal>
#include <fstream>

#include <sdbus-c++/sdbus-c++.h>

#include "tests/engine/EngineFixture.h"

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
