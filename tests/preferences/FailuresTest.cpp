// What becomes of the shared preferences when something they need is missing or goes away.

#include <fstream>
#include <future>
#include <thread>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "tests/preferences/DesktopSession.h"

namespace {

using namespace quorl::preferences;
using namespace quorl::preferences::testing;
using ::testing::AllOf;
using ::testing::HasSubstr;
using ::testing::StartsWith;

class Failures : public DesktopSessionTest {};

TEST_F(Failures, OfTheSettingsServiceAreMendedByTheNextWrite) {
    Told told;
    const auto preferences = openShared(told.callback());
    ASSERT_TRUE(preferences->set(assetSyncLimit, 25).changed);

    ASSERT_TRUE(killSettingsService());
    EXPECT_EQ(preferences->get(assetSyncLimit), 25);
    const auto result = preferences->set(assetSyncLimit, 50);

    EXPECT_TRUE(result.changed) << result.problem;
    EXPECT_EQ(gsettings("get", {assetSyncLimit.key}), "@mt 50");
    gsettings("set", {assetSyncEnabled.key, "true"});
    EXPECT_EQ(told.next(), KeySet{assetSyncEnabled.key});
}

TEST_F(Failures, OfTheSettingsServiceInTheMiddleOfAWriteAreMendedByTheWriteItself) {
    const auto preferences = openShared();
    for (std::uint64_t limit = 1; limit <= 20; ++limit) {
        ASSERT_TRUE(preferences->set(assetSyncLimitType, limit).changed);
        ASSERT_TRUE(stopSettingsService());
        auto result =
            std::async(std::launch::async, [&] { return preferences->set(assetSyncLimit, limit); });
        while (preferences->get(assetSyncLimit) != limit) {
            // Until the write has begun.
        }

        ASSERT_TRUE(killSettingsService());

        const auto [changed, problem] = result.get();
        ASSERT_TRUE(changed) << problem;
        ASSERT_EQ(gsettings("get", {assetSyncLimit.key}), "@mt " + std::to_string(limit));
    }
}

TEST_F(Failures, OfTheSettingsServiceInTheMiddleOfWritesLoseNothingSilently) {
    const auto preferences = openShared();
    const std::jthread writer([&](const std::stop_token& stop) {
        for (std::uint64_t limit = 1; !stop.stop_requested(); ++limit) {
            const auto before = preferences->get(assetSyncLimit);
            const auto result = preferences->set(assetSyncLimit, limit);
            EXPECT_EQ(result.changed, result.problem.empty());
            EXPECT_EQ(preferences->get(assetSyncLimit), result.changed ? limit : before);
        }
    });

    for (int kills = 0; kills < 100;) {
        kills += killSettingsService() ? 1 : 0;
    }
}

TEST_F(Failures, OfTheSessionBusLeaveTheValuesReadableAndAreToldByTheNextWrite) {
    SecondBus bus;
    Peer peer(Environment{{"DBUS_SESSION_BUS_ADDRESS", bus.address()}});
    ASSERT_EQ(peer.greeting(), "ready");
    ASSERT_EQ(peer.ask("set asset-sync-limit 25"), "stored");

    bus.kill();

    EXPECT_EQ(peer.ask("get asset-sync-limit"), "25");
    EXPECT_THAT(peer.ask("set asset-sync-limit 50"),
                AllOf(StartsWith("failed: "), HasSubstr("asset-sync-limit"),
                      HasSubstr("no session bus"), HasSubstr("Log in again")));
    EXPECT_EQ(peer.ask("get asset-sync-limit"), "25");
}

TEST_F(Failures, OfTheSessionBusAreOverWhenItIsBack) {
    SecondBus bus;
    Peer peer(Environment{{"DBUS_SESSION_BUS_ADDRESS", bus.address()}});
    ASSERT_EQ(peer.ask("set asset-sync-limit 25"), "stored");

    bus.kill();
    bus.start();

    // Until it has heard that the old bus is gone, it says so.
    auto answer = peer.ask("set asset-sync-limit 50");
    for (; answer != "stored"; answer = peer.ask("set asset-sync-limit 50")) {
        ASSERT_THAT(answer, StartsWith("failed: "));
    }
    EXPECT_EQ(gsettings("get", {assetSyncLimit.key}), "@mt 50");
}

TEST_F(Failures, ToFindASessionBusLeaveSettingsThatLastAsLongAsTheProgram) {
    gsettings("set", {assetSyncLimit.key, "25"});

    Peer peer(Environment{{"DBUS_SESSION_BUS_ADDRESS", "unix:path=/nonexistent"}});

    EXPECT_THAT(peer.greeting(), AllOf(StartsWith("limited: "), HasSubstr("no session bus"),
                                       HasSubstr("dbus-run-session")));
    EXPECT_EQ(peer.ask("get asset-sync-limit"), "25") << "begins with what is stored";
    EXPECT_EQ(peer.ask("taps 50"), "done");
    EXPECT_EQ(peer.ask("get asset-sync-limit"), "50");
    EXPECT_EQ(peer.ask("set asset-sync-enabled true"), "stored") << "and none of it was told";
    EXPECT_EQ(gsettings("get", {assetSyncLimit.key}), "@mt 25");
}

TEST_F(Failures, ToFindDconfSayWhichPackageIsMissing) {
    Peer peer(Environment{{"GIO_MODULE_DIR", "/nonexistent"}});

    EXPECT_THAT(peer.greeting(), AllOf(StartsWith("limited: "),
                                       HasSubstr("Install the package dconf-gsettings-backend")));
    EXPECT_EQ(peer.ask("set asset-sync-limit 25"), "stored");
    EXPECT_EQ(peer.ask("get asset-sync-limit"), "25");
}

TEST_F(Failures, ThatAnEnvironmentVariableCausesSayWhichOne) {
    Peer peer(Environment{{"GSETTINGS_BACKEND", "memory"}});

    EXPECT_THAT(peer.greeting(),
                AllOf(StartsWith("limited: "), HasSubstr("Unset"), HasSubstr("GSETTINGS_BACKEND")));
}

TEST_F(Failures, ToStoreAValueKeepTheOldOne) {
    const std::filesystem::path folder = std::filesystem::path(g_get_user_config_dir()) / "dconf";
    const auto preferences = openShared();
    ASSERT_TRUE(preferences->set(assetSyncLimit, 25).changed);
    ASSERT_TRUE(killSettingsService());
    // The service cannot make its folder where a file has the name.
    std::filesystem::rename(folder, folder.string() + "-away");
    std::ofstream(folder) << "not a folder";

    const auto result = preferences->set(assetSyncLimit, 50);

    EXPECT_FALSE(result.changed);
    EXPECT_THAT(result.problem, AllOf(HasSubstr("asset-sync-limit"), HasSubstr(folder.string())));
    std::filesystem::remove(folder);
    std::filesystem::rename(folder.string() + "-away", folder);
    EXPECT_EQ(preferences->get(assetSyncLimit), 25);
    EXPECT_TRUE(preferences->set(assetSyncLimit, 50).changed) << "mended";
}

/// A copy of the peer in a folder of its own, laid out like an installation.
class Installation : public Failures {
  protected:
    Installation() {
        std::filesystem::create_directories(program_.parent_path());
        std::filesystem::create_directories(schemas_);
        std::filesystem::copy_file(PEER_PROGRAM, program_,
                                   std::filesystem::copy_options::overwrite_existing);
    }

    ~Installation() override { std::filesystem::remove_all(prefix_); }

    /// Installs the schemas as this command of sed changes them.
    void installSchemas(const std::string& change) {
        for (const auto& source : std::filesystem::directory_iterator(SCHEMA_SOURCES)) {
            std::ofstream(schemas_ / source.path().filename())
                << run({"sed", change, source.path().string()});
        }
        run({"glib-compile-schemas", "--strict", schemas_.string()});
    }

    [[nodiscard]] std::string greeting() const {
        return Peer(Environment{{"XDG_DATA_DIRS", "/nonexistent"}}, program_).greeting();
    }

    const std::filesystem::path prefix_ =
        std::filesystem::path(g_get_user_runtime_dir()) / "installation";
    const std::filesystem::path program_ = prefix_ / "bin" / "peer";
    const std::filesystem::path schemas_ = prefix_ / "share" / "glib-2.0" / "schemas";
};

TEST_F(Installation, FindsItsSchemasBesideTheProgram) {
    installSchemas("");

    EXPECT_EQ(greeting(), "ready");
}

TEST_F(Installation, WithoutASchemaSaysWhereItSearchedAndWhatToDo) {
    EXPECT_THAT(greeting(), AllOf(StartsWith("failed: "), HasSubstr(schemas_.string()),
                                  HasSubstr("/nonexistent/glib-2.0/schemas"), HasSubstr("Install"),
                                  HasSubstr("glib-compile-schemas")));
}

TEST_F(Installation, WithASchemaThatLacksAValueSaysWhichOne) {
    installSchemas("s/asset-sync-enabled/asset-sync-on/");

    EXPECT_THAT(greeting(), AllOf(StartsWith("failed: "), HasSubstr("another version"),
                                  HasSubstr("asset-sync-enabled")));
}

TEST_F(Installation, WithASchemaThatHasAValueOfAnotherTypeSaysWhichOne) {
    installSchemas(R"(s/limit-type" type="t"/limit-type" type="u"/)");

    EXPECT_THAT(greeting(), AllOf(StartsWith("failed: "), HasSubstr("another version"),
                                  HasSubstr("asset-sync-limit-type")));
}

} // namespace
