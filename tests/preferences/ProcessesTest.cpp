// Several programs that use the shared preferences at the same time, or end in the middle.

#include <array>

#include <gtest/gtest.h>

#include "tests/preferences/DesktopSession.h"
#include "tests/preferences/ValueText.h"

namespace {

using namespace quorl::preferences;
using namespace quorl::preferences::testing;

constexpr int manyTaps = 100;

class Processes : public DesktopSessionTest {};

TEST_F(Processes, SeeEachOfManyQuickTapsWithTheAmountBeforeTheType) {
    Bystander bystander;
    Peer reader;
    Peer tapper;

    ASSERT_EQ(tapper.ask("taps " + std::to_string(manyTaps)), "done");
    ASSERT_EQ(tapper.ask("set asset-sync-enabled true"), "stored");

    for (int tap = 0; tap < manyTaps; ++tap) {
        ASSERT_EQ(bystander.next(), assetSyncLimit.key) << "at tap " << tap;
        ASSERT_EQ(bystander.next(), assetSyncLimitType.key) << "at tap " << tap;
        ASSERT_EQ(reader.nextTold(), assetSyncLimit.key) << "at tap " << tap;
        ASSERT_EQ(reader.nextTold(), assetSyncLimitType.key) << "at tap " << tap;
    }
    EXPECT_EQ(bystander.next(), assetSyncEnabled.key) << "after exactly these";
    EXPECT_EQ(reader.nextTold(), assetSyncEnabled.key) << "after exactly these";
}

TEST_F(Processes, ReadAValueAsSoonAsItsSetterHasReturned) {
    const auto preferences = openShared();
    Peer reader;

    for (std::uint64_t tap = 1; tap <= manyTaps; ++tap) {
        const auto type = tap % 2;
        ASSERT_TRUE(preferences->set(assetSyncLimit, tap).changed);
        ASSERT_EQ(reader.ask("get asset-sync-limit"), std::to_string(tap));
        ASSERT_EQ(reader.ask("get asset-sync-limit-type"), std::to_string(1 - type))
            << "the type comes later";
        ASSERT_TRUE(preferences->set(assetSyncLimitType, type).changed);
        ASSERT_EQ(reader.ask("get asset-sync-limit-type"), std::to_string(type));
    }
}

TEST_F(Processes, SeeTheFlagBeforeThePlaylist) {
    Bystander bystander;
    const auto preferences = openShared();

    ASSERT_TRUE(preferences->set(assetSyncEnabled, true).changed);
    ASSERT_TRUE(preferences->set(assetSyncPlaylistPersistentID, 42).changed);

    EXPECT_EQ(bystander.next(), assetSyncEnabled.key);
    EXPECT_EQ(bystander.next(), assetSyncPlaylistPersistentID.key);
}

TEST_F(Processes, ThatWriteDifferentValuesAtTheSameMomentBothSucceed) {
    const auto preferences = openShared();
    Peer app;
    Peer engine;

    for (int round = 1; round <= 200; ++round) {
        const auto number = std::to_string(round);
        app.say("set asset-sync-limit " + number);
        engine.say("set last-fully-sent-asset-sync-playlist-version " + number);
        ASSERT_EQ(app.reply(), "stored");
        ASSERT_EQ(engine.reply(), "stored");
        ASSERT_EQ(preferences->get(assetSyncLimit), round);
        ASSERT_EQ(preferences->get(lastFullySentAssetSyncPlaylistVersion), round);
    }
}

TEST_F(Processes, ThatWriteTheSameValueAtTheSameMomentBothSucceed) {
    Peer app;
    Peer engine;

    for (int round = 1; round <= 200; ++round) {
        app.say("set asset-sync-limit " + std::to_string(round));
        engine.say("set asset-sync-limit " + std::to_string(1000 + round));
        ASSERT_EQ(app.reply(), "stored");
        ASSERT_EQ(engine.reply(), "stored");
        const auto left = app.ask("get asset-sync-limit");
        ASSERT_TRUE(left == std::to_string(round) || left == std::to_string(1000 + round)) << left;
    }
}

/// A peer that counts a value up until it is killed.
class Counter {
  public:
    Counter(const char* key, std::uint64_t first) : key_(key) {
        peer_.say("count " + key_ + " " + std::to_string(first));
    }

    /// Kills it while it counts. Gives back the last number of which it said that it was stored.
    std::uint64_t kill() {
        auto last = numberIn(peer_.reply());
        peer_.kill();
        for (auto line = peer_.reply(); !line.empty(); line = peer_.reply()) {
            last = numberIn(line);
        }
        return last;
    }

    [[nodiscard]] const std::string& key() const { return key_; }

  private:
    std::string key_;
    Peer peer_;
};

TEST_F(Processes, ThatAreKilledWhileWritingLoseNothingThatTheySaidWasStored) {
    constexpr std::array keys{
        assetSyncPlaylistPersistentID.key, assetSyncLimit.key, assetSyncLimitType.key,
        lastFullySentAssetSyncPlaylistPersistentID.key, lastFullySentAssetSyncPlaylistVersion.key};
    constexpr std::uint64_t rounds = 40;

    for (std::uint64_t round = 1; round <= rounds; ++round) {
        std::deque<Counter> counters;
        for (const auto* key : keys) {
            counters.emplace_back(key, 1'000'000 * round);
        }
        std::map<std::string, std::uint64_t> lasts;
        for (auto& counter : counters) {
            lasts[counter.key()] = counter.kill();
        }
        Peer reader;
        for (const auto& [key, last] : lasts) {
            const auto left = numberIn(reader.ask("get " + key));
            // The kill may have come after a write and before its number was said.
            ASSERT_TRUE(left == last || left == last + 1)
                << key << " is " << left << " where " << last << " was stored";
        }
    }
}

} // namespace
