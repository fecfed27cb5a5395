#include <filesystem>
#include <future>
#include <utility>

#include <gmock/gmock.h>
#include <nlohmann/json.hpp>

#include "services/engine/Client.h"
#include "tests/engine/Process.h"
#include "tests/engine/SlowDevice.h"
#include "tests/quorl/QuorlProcess.h"
#include "tests/quorl/SampleMusic.h"
#include "tests/quorl/StoredPreferences.h"
#include "tests/quorl/window/Window.h"

namespace quorl::tests {

namespace {

using testing::HasSubstr;

/// The real engine beside the real app, on a bus of their own.
class WithEngine : public testing::Test {
  protected:
    explicit WithEngine(const QStringList& options = {}) {
        engine_.start(QStringLiteral(QUORL_ENGINE), options);
        if (!engine_.waitForStarted()) {
            throw std::runtime_error("the engine does not start");
        }
    }

    ~WithEngine() override {
        engine_.terminate();
        engine_.waitForFinished();
    }

    [[nodiscard]] std::vector<std::string> arguments(const std::string& mode) const {
        return {mode};
    }

    [[nodiscard]] static std::filesystem::path onWearable(const std::string& name) {
        return std::filesystem::path(qgetenv("XDG_DATA_HOME").toStdString()) /
               "quorl/wearable/Music" / name;
    }

    SampleMusic music_;
    QProcess engine_;
};

/// A sync of "Road Trip" takes longer than any test.
class WithSlowEngine : public WithEngine {
  protected:
    WithSlowEngine() : WithEngine({QStringLiteral("--rate-limit"), QStringLiteral("20000")}) {}

    /// Chooses "Road Trip" in `quorl`, and waits until its songs are being copied.
    static void choose(QuorlProcess& quorl) {
        quorl.say("1");
        quorl.say("2");
        quorl.readUntil("% Synced…");
    }
};

TEST_F(WithSlowEngine, appThatIsKilledAndOpenedAgainShowsTheRunningSessionToItsEnd) {
    {
        QuorlProcess quorl(arguments("--text"));
        choose(quorl);
        quorl.kill();
    }
    Window window(music_.path());
    window.press(Qt::Key_Return);
    EXPECT_TRUE(window.waitForRow(QRegularExpression("✓ Road Trip: [0-9]+% Synced…")));
    EXPECT_FALSE(std::filesystem::exists(onWearable("Road Trip.m3u8")));

    engine::Client client([](const engine::Event&) {});
    client.setRateLimit(0);

    EXPECT_TRUE(window.waitForRow(QRegularExpression("✓ Road Trip: Synced")));
    EXPECT_TRUE(std::filesystem::exists(onWearable("Road Trip.m3u8")));
}

TEST_F(WithSlowEngine, engineThatIsKilledLeavesNoSessionOnTheScreen) {
    QuorlProcess quorl(arguments("--text"));
    choose(quorl);
    engine_.kill();
    quorl.readUntil("  2  ✓ Road Trip: Sync Pending…\n");
    quorl.say("b");
    quorl.say("b");
    quorl.readUntil("The sync engine is not running");
    EXPECT_EQ(quorl.end(), 0);
}

TEST(WithBusOfItsOwn, busThatGoesAwayIsToldAndTheAppNeitherEndsNorSpins) {
    const SampleMusic music;
    syncd::testing::SecondBus bus;
    QuorlProcess quorl({"--text"}, {{"DBUS_SESSION_BUS_ADDRESS", bus.address()}});
    quorl.say("1");
    quorl.readUntil("  3  ✓ None\n");

    bus.kill();

    quorl.readErrorsUntil("quorl: The session bus is gone");
    std::optional<std::string> before;
    int tries = 0;
    do {
        before = quorl.wakeUpsOfSleepingThreads();
        quorl.say("?");
        quorl.readUntil("A number chooses the row");
    } while ((!before || before != quorl.wakeUpsOfSleepingThreads()) && ++tries < 1000);
    EXPECT_LT(tries, 1000) << "a thread is still busy";
    quorl.say("2");
    quorl.readErrorsUntil("was not changed. There is no session bus");
    EXPECT_EQ(quorl.end(), 0);
}

TEST_F(WithEngine, chosenPlaylistIsSyncedOnlyWhenItIsOnTheWearable) {
    QuorlProcess quorl(arguments("--text"));
    quorl.say("1");
    quorl.readUntil("  3  ✓ None\n");
    quorl.say("2");
    quorl.readUntil("  2  ✓ Road Trip: Synced\n");
    EXPECT_TRUE(std::filesystem::exists(onWearable("Road Trip.m3u8")));
    EXPECT_EQ(quorl.end(), 0);
}

TEST_F(WithEngine, offTheChargerThePlaylistWaits) {
    QuorlProcess quorl(arguments("--text"));
    quorl.say("b");
    quorl.readUntil("  2  Simulated Charger: on\n");
    quorl.say("2");
    quorl.readUntil("  2  Simulated Charger: off\n");
    quorl.say("7");
    quorl.say("1");
    quorl.readUntil("  3  ✓ None\n");
    quorl.say("2");
    quorl.readUntil("  2  ✓ Road Trip: Sync Pending…\n");
    quorl.say("b");
    quorl.say("b");
    quorl.readUntil("  2  Simulated Charger: off\n");
    EXPECT_FALSE(std::filesystem::exists(onWearable("Road Trip.m3u8")));
    quorl.say("2");
    quorl.readUntil("Everything that could be found is on the Velora.");
    EXPECT_TRUE(std::filesystem::exists(onWearable("Road Trip.m3u8")));
    EXPECT_EQ(quorl.end(), 0);
}

TEST_F(WithEngine, pickingNoneLeavesTheWearableAsItIs) {
    QuorlProcess quorl(arguments("--text"));
    quorl.say("1");
    quorl.say("2");
    quorl.readUntil("  2  ✓ Road Trip: Synced\n");
    quorl.say("3");
    quorl.readUntil("  3  ✓ None\n");
    EXPECT_EQ(quorl.end(), 0);
    EXPECT_TRUE(std::filesystem::exists(onWearable("Road Trip.m3u8")));
}

TEST_F(WithSlowEngine, statusTellsOfTheRunningSession) {
    QuorlProcess quorl(arguments("--text"));
    choose(quorl);

    QuorlProcess status({"--status", "--json"});
    ASSERT_EQ(status.end(), 0);

    const auto json = nlohmann::json::parse(status.output());
    EXPECT_EQ(json["playlist"], "Road Trip");
    EXPECT_EQ(json["state"], "syncing");
    EXPECT_GE(json["progress"], 0.0);
    EXPECT_LT(json["progress"], 1.0);
    EXPECT_EQ(quorl.end(), 0);
}

TEST_F(WithEngine, statusIsPrintedForScripts) {
    {
        QuorlProcess quorl(arguments("--text"));
        quorl.say("1");
        quorl.say("2");
        quorl.readUntil("  2  ✓ Road Trip: Synced\n");
        EXPECT_EQ(quorl.end(), 0);
    }
    auto asked = arguments("--status");
    asked.emplace_back("--json");
    QuorlProcess status(asked);
    ASSERT_EQ(status.end(), 0);
    const auto json = nlohmann::json::parse(status.output());
    EXPECT_EQ(json["engine"], true);
    EXPECT_EQ(json["playlist"], "Road Trip");
    EXPECT_EQ(json["state"], "synced");
    EXPECT_EQ(json["wearable"]["connected"], true);
    EXPECT_EQ(json["lastSync"]["success"], true);
}

TEST_F(WithEngine, statusTellsWhatOfThePlaylistIsNotOnItsWay) {
    music_.folder().write("Gaps.m3u8", "one.flac\ngone.mp3\nhttp://somewhere/radio\n");
    {
        QuorlProcess quorl(arguments("--text"));
        quorl.say("1");
        quorl.say("1");
        quorl.readUntil("Gaps: Synced\n");
        EXPECT_EQ(quorl.end(), 0);
    }
    QuorlProcess status({"--status"});
    ASSERT_EQ(status.end(), 0);
    EXPECT_THAT(status.output(),
                HasSubstr("Left out:   2\n"
                          "  gone.mp3: There is no such file. Put it back, or take it out of the "
                          "playlist.\n"
                          "  http://somewhere/radio: It is not on this machine. Download it into "
                          "the music folder.\n"));
    QuorlProcess asked({"--status", "--json"});
    ASSERT_EQ(asked.end(), 0);
    const auto json = nlohmann::json::parse(asked.output());
    EXPECT_EQ(json["statusCode"], "up-to-date-but");
    EXPECT_EQ(json["leftOut"], 2);
    EXPECT_EQ(json["beyondLimit"], 0);
    EXPECT_EQ(json["wearable"]["songs"], 1);
    EXPECT_EQ(json["lastComplete"], json["lastSync"]["microsecondsSince1970"]);
}

TEST_F(WithEngine, titlesSteerNoTerminalWhenTheStatusIsPrinted) {
    music_.folder().write("Evil.m3u8",
                          "#PLAYLIST:Evil\x1b[2J\u009B1m\u202Ekcab\u2066in\u2028line\none.flac\n");
    {
        QuorlProcess quorl(arguments("--text"));
        quorl.say("1");
        quorl.say("1");
        quorl.readUntil("line: Synced\n");
        EXPECT_EQ(quorl.end(), 0);
    }
    QuorlProcess status({"--status"});
    ASSERT_EQ(status.end(), 0);
    EXPECT_THAT(status.output(), HasSubstr("Playlist:   Evil\uFFFD[2J\uFFFD1m\uFFFDkcab\uFFFDin"
                                           "\uFFFDline\n"));
    QuorlProcess json({"--status", "--json"});
    ASSERT_EQ(json.end(), 0);
    EXPECT_THAT(json.output(), HasSubstr(R"("Evil\u001b[2J\u009b1m\u202ekcab\u2066in\u2028line")"));
}

TEST(WithHangingWearable, appIsDrawnAndLeft) {
    syncd::testing::SlowDevice device;
    if (!device.isThere()) {
        GTEST_SKIP() << "only root may mount";
    }
    const SampleMusic music;
    device.stall();
    QuorlProcess quorl({"--text", "--music", music.path(), "--wearable", device.path()});
    quorl.readUntil("Synced Playlist");
    device.awaitStalled();

    EXPECT_EQ(quorl.end(), 0);
}

TEST(WithoutEngine, statusSaysSo) {
    const SampleMusic music;
    QuorlProcess status({"--status"});
    EXPECT_EQ(status.end(), 0);
    EXPECT_THAT(status.output(), HasSubstr("not running; start quorl-syncd"));

    QuorlProcess german({"--status"}, {{"LANGUAGE", "de"}});
    EXPECT_EQ(german.end(), 0);
    EXPECT_THAT(german.output(), HasSubstr("Dienst:         läuft nicht; starte quorl-syncd"));
}

TEST(WithoutEngine, statusDoesNotGuessWhatBecameOfAChoice) {
    storePreference("asset-sync-playlist-persistent-id", "just uint64 1");
    storePreference("last-fully-sent-asset-sync-playlist-persistent-id", "just uint64 1");
    QuorlProcess off({"--status"});
    EXPECT_EQ(off.end(), 0);
    EXPECT_THAT(off.output(), HasSubstr("Playlist:   none\nSync:       off\n"));
    storePreference("asset-sync-enabled", "true");

    QuorlProcess status({"--status"});
    EXPECT_EQ(status.end(), 0);
    EXPECT_THAT(status.output(), HasSubstr("Playlist:   unknown\nSync:       unknown\n"));
    QuorlProcess asked({"--status", "--json"});
    EXPECT_EQ(asked.end(), 0);
    const auto json = nlohmann::json::parse(asked.output());
    EXPECT_EQ(json["engine"], false);
    EXPECT_EQ(json["playlist"], nullptr);
    EXPECT_EQ(json["state"], "unknown");
    EXPECT_EQ(json["progress"], nullptr);
}

/// What the engine of the session has as its music folder.
std::string musicFolderOfEngine() {
    std::promise<std::string> folder;
    bool isTold = false;
    const engine::Client client([&](const engine::Event& event) {
        if (event.state->isThere && !std::exchange(isTold, true)) {
            folder.set_value(event.state->engine.musicFolder);
        }
    });
    return folder.get_future().get();
}

TEST_F(WithSlowEngine, commandsThatOnlyReadLeaveTheMusicFolderAndTheRunningSyncAlone) {
    QuorlProcess quorl(arguments("--text"));
    choose(quorl);
    const TemporaryDirectory other;
    const auto picture = (other.path() / "a.png").string();

    for (const std::vector<std::string>& command : {std::vector<std::string>{"--status"},
                                                    {"--library"},
                                                    {"--screenshot", picture},
                                                    {"--text"}}) {
        auto elsewhere = command;
        elsewhere.insert(elsewhere.end(), {"--music", other.path().string()});
        for (const auto& asked : {command, elsewhere}) {
            QuorlProcess reader(asked);
            EXPECT_EQ(reader.end(), 0) << asked.front() << reader.errors();
        }
    }

    EXPECT_EQ(musicFolderOfEngine(), music_.path());
    QuorlProcess status({"--status", "--json"});
    ASSERT_EQ(status.end(), 0);
    EXPECT_EQ(nlohmann::json::parse(status.output())["state"], "syncing");
    EXPECT_EQ(quorl.end(), 0);
}

TEST(WithoutBus, statusIsAFailure) {
    QuorlProcess status({"--status"}, {{"DBUS_SESSION_BUS_ADDRESS", "unix:path=/nowhere"}});
    EXPECT_EQ(status.end(), 1);
    EXPECT_THAT(status.errors(), HasSubstr("The session bus is gone"));
    EXPECT_EQ(status.output(), "");
}

TEST(WithoutEngine, frontPageSaysWhatToDo) {
    const SampleMusic music;
    QuorlProcess quorl({"--text"});
    quorl.say("b");
    quorl.readUntil("The sync engine is not running");
    EXPECT_EQ(quorl.end(), 0);
}

} // namespace

} // namespace quorl::tests
