// What a program is told of changes that others make.

#include <future>
#include <mutex>

#include <gtest/gtest.h>

#include "tests/preferences/DesktopSession.h"

namespace {

using namespace quorl::preferences;
using namespace quorl::preferences::testing;

class Changes : public DesktopSessionTest {};

TEST_F(Changes, ByAnotherProgramAreToldWithTheKeyOnceEach) {
    Told told;
    const auto preferences = openShared(told.callback());

    gsettings("set", {assetSyncLimit.key, "25"});
    EXPECT_EQ(told.next(), KeySet{assetSyncLimit.key});
    gsettings("set", {assetSyncEnabled.key, "true"});
    EXPECT_EQ(told.next(), KeySet{assetSyncEnabled.key});
    gsettings("reset", {assetSyncLimit.key});
    EXPECT_EQ(told.next(), KeySet{assetSyncLimit.key});
}

TEST_F(Changes, CanBeReadWhenTheyAreTold) {
    std::promise<std::optional<std::uint64_t>> read;
    const auto preferences = openShared([&](SharedPreferences& changed, const KeySet&) {
        read.set_value(changed.get(assetSyncLimit));
    });

    gsettings("set", {assetSyncLimit.key, "25"});

    EXPECT_EQ(read.get_future().get(), 25);
}

TEST_F(Changes, ByThisProgramAreNotTold) {
    Told told;
    const auto preferences = openShared(told.callback());

    for (std::uint64_t limit = 1; limit <= 100; ++limit) {
        ASSERT_TRUE(preferences->set(assetSyncLimit, limit).changed);
    }
    gsettings("set", {assetSyncEnabled.key, "true"});

    EXPECT_EQ(told.next(), KeySet{assetSyncEnabled.key});
}

TEST_F(Changes, ByThisProgramRightAfterOpeningAreNotTold) {
    for (std::uint64_t limit = 1; limit <= 50; ++limit) {
        Told told;
        const auto preferences = openShared(told.callback());

        ASSERT_TRUE(preferences->set(assetSyncLimit, limit).changed);
        gsettings("set", {assetSyncEnabled.key, limit % 2 == 0 ? "false" : "true"});

        ASSERT_EQ(told.next(), KeySet{assetSyncEnabled.key}) << "in round " << limit;
    }
}

TEST_F(Changes, ByAnotherProgramRightAfterOpeningAreToldOnce) {
    Peer other;
    for (std::uint64_t limit = 1; limit <= 50; ++limit) {
        Told told;
        const auto preferences = openShared(told.callback());

        ASSERT_EQ(other.ask("set asset-sync-limit " + std::to_string(limit)), "stored");
        ASSERT_EQ(told.next(), KeySet{assetSyncLimit.key}) << "in round " << limit;
        ASSERT_EQ(other.ask("set asset-sync-limit-type " + std::to_string(limit)), "stored");
        ASSERT_EQ(told.next(), KeySet{assetSyncLimitType.key}) << "in round " << limit;
    }
}

TEST_F(Changes, OfAValueThatThisProgramWroteAreToldWhenAnotherWritesItToo) {
    Told told;
    const auto preferences = openShared(told.callback());
    Peer other;

    for (std::uint64_t round = 1; round <= 50; ++round) {
        ASSERT_TRUE(preferences->set(assetSyncLimit, 1000 + round).changed);
        ASSERT_EQ(other.ask("set asset-sync-limit " + std::to_string(round)), "stored");
        ASSERT_EQ(told.next(), KeySet{assetSyncLimit.key});
        ASSERT_EQ(preferences->get(assetSyncLimit), round);
    }
}

TEST_F(Changes, ToAndFroAreToldAsTwoChangesAlsoToAListenerThatIsLate) {
    Told told;
    std::promise<void> late;
    const auto preferences = openShared([&](SharedPreferences& changed, const KeySet& keys) {
        told.callback()(changed, keys);
        if (keys.contains(assetSyncLimit.key)) {
            late.get_future().wait();
        }
    });
    Peer other;
    ASSERT_EQ(other.ask("set asset-sync-limit 1"), "stored");
    ASSERT_EQ(told.next(), KeySet{assetSyncLimit.key});

    ASSERT_EQ(other.ask("set asset-sync-enabled true"), "stored");
    ASSERT_EQ(other.ask("set asset-sync-enabled false"), "stored");
    ASSERT_EQ(other.ask("set asset-sync-limit-type 1"), "stored");
    late.set_value();

    EXPECT_EQ(told.next(), KeySet{assetSyncEnabled.key});
    EXPECT_EQ(told.next(), KeySet{assetSyncEnabled.key});
    EXPECT_EQ(told.next(), KeySet{assetSyncLimitType.key});
}

TEST_F(Changes, ToAWholeFolderAreToldForTheValuesThatAreDifferentNow) {
    Told told;
    const auto preferences = openShared(told.callback());
    ASSERT_TRUE(preferences->set(assetSyncLimit, 25).changed);
    ASSERT_TRUE(preferences->set(assetSyncEnabled, true).changed);

    run({"dconf", "reset", "-f", "/org/quorl/"});

    EXPECT_EQ(told.next(), (KeySet{assetSyncLimit.key, assetSyncEnabled.key}));
    EXPECT_EQ(preferences->get(assetSyncLimit), assetSyncLimit.defaultValue);
}

TEST_F(Changes, MayBeAnsweredWithAWrite) {
    Told told;
    std::promise<WriteResult> answered;
    const auto preferences = openShared([&](SharedPreferences& changed, const KeySet& keys) {
        if (keys.contains(assetSyncLimit.key)) {
            answered.set_value(changed.set(assetSyncLimitType, LimitType::Songs));
        }
        told.callback()(changed, keys);
    });

    gsettings("set", {assetSyncLimit.key, "25"});
    EXPECT_TRUE(answered.get_future().get().changed);
    gsettings("set", {assetSyncEnabled.key, "true"});

    EXPECT_EQ(gsettings("get", {assetSyncLimitType.key}), "uint64 1");
    EXPECT_EQ(told.next(), KeySet{assetSyncLimit.key});
    EXPECT_EQ(told.next(), KeySet{assetSyncEnabled.key}) << "the own write is not told";
}

TEST_F(Changes, AreToldWhileAWriterHoldsALockThatTheListenerWants) {
    std::mutex lock;
    std::promise<void> listening;
    std::promise<void> listened;
    const auto preferences = openShared([&](SharedPreferences&, const KeySet&) {
        listening.set_value();
        const std::scoped_lock held(lock);
        listened.set_value();
    });

    {
        const std::scoped_lock held(lock);
        gsettings("set", {assetSyncEnabled.key, "true"});
        listening.get_future().wait();
        EXPECT_TRUE(preferences->set(assetSyncLimit, 25).changed);
    }

    listened.get_future().wait();
}

TEST_F(Changes, ByAnotherObjectOfThisProgramAreTold) {
    Told told;
    const auto first = openShared(told.callback());
    const auto second = openShared();

    ASSERT_TRUE(second->set(assetSyncLimit, 25).changed);

    EXPECT_EQ(told.next(), KeySet{assetSyncLimit.key});
}

TEST_F(Changes, AreNotToldToAnObjectThatIsGone) {
    Peer other;
    other.say("count asset-sync-limit 1000");

    for (int round = 0; round < 30; ++round) {
        auto told = std::make_unique<Told>();
        auto preferences = openShared(told->callback());
        if (round % 2 == 0) {
            (void)told->next();
        }
        preferences.reset();
        told.reset();
    }
}

} // namespace
