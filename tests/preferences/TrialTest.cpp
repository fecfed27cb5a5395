// The preferences of a trial.

#include <gtest/gtest.h>

#include "tests/preferences/DesktopSession.h"

namespace {

using namespace quorl::preferences;
using namespace quorl::preferences::testing;

class PreferencesOfATrial : public DesktopSessionTest {
  protected:
    PreferencesOfATrial() {
        run({"gsettings", "reset-recursively", "org.quorl.Velora.Trial.AssetSync"});
        run({"gsettings", "reset-recursively", "org.quorl.Velora.Trial.Places"});
    }

    static std::unique_ptr<SharedPreferences> open(SharedPreferences::Changed changed = {}) {
        auto [preferences, problem] =
            SharedPreferences::open(std::move(changed), quorl::base::Purpose::Trial);
        EXPECT_EQ(problem, "");
        return std::move(preferences);
    }
};

TEST_F(PreferencesOfATrial, AreSeenByTheOthersOfTheTrialAndByNobodyElse) {
    Peer trial({}, PEER_PROGRAM, quorl::base::Purpose::Trial);
    Peer other;
    const auto preferences = open();

    ASSERT_EQ(preferences->set(musicFolder, "/some/where").problem, "");
    ASSERT_EQ(preferences->set(assetSyncLimit, 25).problem, "");

    EXPECT_EQ(trial.ask("get music-folder"), "/some/where");
    EXPECT_EQ(trial.ask("get asset-sync-limit"), "25");
    EXPECT_EQ(other.ask("get music-folder"), "");
    EXPECT_EQ(other.ask("get asset-sync-limit"), "500");
}

TEST_F(PreferencesOfATrial, AreToldToTheOthersOfTheTrialAndToNobodyElse) {
    Told told;
    const auto used = openShared(told.callback());
    Peer trial({}, PEER_PROGRAM, quorl::base::Purpose::Trial);
    Peer other;
    const auto preferences = open();

    ASSERT_TRUE(preferences->set(assetSyncLimit, 25).changed);
    EXPECT_EQ(trial.nextTold(), assetSyncLimit.key);

    ASSERT_EQ(other.ask("set music-folder /of/all"), "stored");
    EXPECT_EQ(told.next(), KeySet{musicFolder.key}) << "nothing before";
}

} // namespace
