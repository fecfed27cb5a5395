#include <filesystem>

#include <gmock/gmock.h>
#include <nlohmann/json.hpp>

#include "tests/quorl/Music.h"
#include "tests/quorl/Program.h"

namespace quorl::tests {

namespace {

using testing::HasSubstr;

/// The real engine beside the real app, on a bus of their own.
class WithEngine : public testing::Test {
  protected:
    WithEngine() {
        engine_.start(QStringLiteral(QUORL_ENGINE), QStringList());
        if (!engine_.waitForStarted()) {
            throw std::runtime_error("the engine does not start");
        }
    }

    ~WithEngine() override {
        engine_.terminate();
        engine_.waitForFinished();
    }

    [[nodiscard]] std::vector<std::string> arguments(const std::string& mode) const {
        return {mode, "--music", music_.path()};
    }

    [[nodiscard]] static std::filesystem::path onWearable(const std::string& name) {
        return std::filesystem::path(qgetenv("XDG_DATA_HOME").toStdString()) /
               "quorl/wearable/Music" / name;
    }

    Music music_;
    QProcess engine_;
};

TEST_F(WithEngine, chosenPlaylistIsSyncedOnlyWhenItIsOnTheWearable) {
    Program quorl(arguments("--text"));
    quorl.say("1");
    quorl.readUntil("  3  ✓ None\n");
    quorl.say("2");
    quorl.readUntil("  2  ✓ Road Trip: Synced\n");
    EXPECT_TRUE(std::filesystem::exists(onWearable("Road Trip.m3u8")));
    EXPECT_EQ(quorl.end(), 0);
}

TEST_F(WithEngine, offTheChargerThePlaylistWaits) {
    Program quorl(arguments("--text"));
    quorl.say("b");
    quorl.readUntil("  2  On Charger: on\n");
    quorl.say("2");
    quorl.readUntil("  2  On Charger: off\n");
    quorl.say("5");
    quorl.say("1");
    quorl.readUntil("  3  ✓ None\n");
    quorl.say("2");
    quorl.readUntil("  2  ✓ Road Trip: Sync Pending…\n");
    quorl.say("b");
    quorl.say("b");
    quorl.readUntil("  2  On Charger: off\n");
    EXPECT_FALSE(std::filesystem::exists(onWearable("Road Trip.m3u8")));
    quorl.say("2");
    quorl.readUntil("1 song synced to Velora.");
    EXPECT_TRUE(std::filesystem::exists(onWearable("Road Trip.m3u8")));
    EXPECT_EQ(quorl.end(), 0);
}

TEST_F(WithEngine, pickingNoneLeavesTheWearableAsItIs) {
    Program quorl(arguments("--text"));
    quorl.say("1");
    quorl.say("2");
    quorl.readUntil("  2  ✓ Road Trip: Synced\n");
    quorl.say("3");
    quorl.readUntil("  3  ✓ None\n");
    EXPECT_EQ(quorl.end(), 0);
    EXPECT_TRUE(std::filesystem::exists(onWearable("Road Trip.m3u8")));
}

TEST_F(WithEngine, statusIsPrintedForScripts) {
    {
        Program quorl(arguments("--text"));
        quorl.say("1");
        quorl.say("2");
        quorl.readUntil("  2  ✓ Road Trip: Synced\n");
        EXPECT_EQ(quorl.end(), 0);
    }
    auto asked = arguments("--status");
    asked.emplace_back("--json");
    Program status(asked);
    ASSERT_EQ(status.end(), 0);
    const auto json = nlohmann::json::parse(status.output());
    EXPECT_EQ(json["engine"], true);
    EXPECT_EQ(json["playlist"], "Road Trip");
    EXPECT_EQ(json["state"], "synced");
    EXPECT_EQ(json["wearable"]["connected"], true);
    EXPECT_EQ(json["lastSync"]["success"], true);
}

TEST(WithoutEngine, statusSaysSo) {
    const Music music;
    Program status({"--status", "--music", music.path()});
    EXPECT_EQ(status.end(), 0);
    EXPECT_THAT(status.output(), HasSubstr("not running; start quorl-syncd"));
}

TEST(WithoutEngine, frontPageSaysWhatToDo) {
    const Music music;
    Program quorl({"--text", "--music", music.path()});
    quorl.say("b");
    quorl.readUntil("The sync engine is not running");
    EXPECT_EQ(quorl.end(), 0);
}

} // namespace

} // namespace quorl::tests
