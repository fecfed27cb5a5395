#include "quorl/adapters/PreferencesStore.h"

#include <gmock/gmock.h>

#include "tests/quorl/StoredPreferences.h"
#include "tests/support/MainQueueRun.h"

namespace quorl::tests {

namespace {

using ::testing::Optional;

/// One program's view of the preferences, and another's.
class TwoStores : public ::testing::Test {
  protected:
    static PreferencesStore opened() {
        return {base::Purpose::Use, [](const std::string& problem) { EXPECT_EQ(problem, ""); }, {}};
    }

    PreferencesStore ours_ = opened();
    PreferencesStore others_ = opened();
};

TEST_F(TwoStores, readWhatTheOtherHasStoredOnceItIsTold) {
    EXPECT_TRUE(others_.setValue(SyncPreference::AssetSyncLimit, 50));
    EXPECT_THAT(others_.value(SyncPreference::AssetSyncLimit), Optional(50));

    runMainQueueUntil(
        [this] { return ours_.value(SyncPreference::AssetSyncLimit) == std::optional(50U); });
}

TEST_F(TwoStores, readItEarlierWhereTheyAreToTakeIt) {
    storePreference("asset-sync-limit", "50");
    ours_.takeValues();
    EXPECT_THAT(ours_.value(SyncPreference::AssetSyncLimit), Optional(50));
}

TEST_F(TwoStores, replaceWhatTheOtherHasStoredAlsoBeforeItIsTold) {
    const auto before = ours_.value(SyncPreference::AssetSyncLimit);
    EXPECT_TRUE(others_.setValue(SyncPreference::AssetSyncLimit, 50));

    EXPECT_TRUE(ours_.setValue(SyncPreference::AssetSyncLimit, before));

    EXPECT_EQ(ours_.value(SyncPreference::AssetSyncLimit), before);
    runMainQueueUntil([&] { return others_.value(SyncPreference::AssetSyncLimit) == before; });
    EXPECT_THAT(storedPreference("asset-sync-limit"), ::testing::HasSubstr("500"));
}

TEST_F(TwoStores, sayWhereAWriteHasChangedNothing) {
    EXPECT_FALSE(ours_.setValue(SyncPreference::AssetSyncEnabled, 0));
    EXPECT_TRUE(ours_.setValue(SyncPreference::AssetSyncEnabled, 1));
    EXPECT_FALSE(ours_.setValue(SyncPreference::AssetSyncEnabled, 1));
}

} // namespace

} // namespace quorl::tests
