// What the engine tells on the bus of the chosen playlist.

#include <gtest/gtest.h>

#include "quorl-syncd/engine/Policy.h"

namespace {

using namespace quorl::syncd;

Situation pending() {
    Situation now;
    now.choices.isSyncEnabled = true;
    now.choices.playlist = 7;
    now.isMusicRead = true;
    now.revision = 1;
    return now;
}

Situation sent() {
    auto now = pending();
    now.choices.lastSent = SentPlaylist{7, 1};
    return now;
}

Situation running(Situation now) {
    now.running = Situation::Running();
    return now;
}

TEST(SyncState, IsPendingAsLongAsThePlaylistWasNotSent) {
    EXPECT_EQ(syncStateOf(pending()), "pending");
    auto earlier = sent();
    earlier.revision = 2;
    EXPECT_EQ(syncStateOf(earlier), "pending");
}

TEST(SyncState, IsSyncedWhenThePlaylistWasSentAsItIsNow) {
    EXPECT_EQ(syncStateOf(sent()), "synced");
}

TEST(SyncState, IsSyncedOnlyWhereTheWearableThatIsThereHasThePlaylist) {
    auto now = sent();
    now.usage.emplace();
    EXPECT_EQ(syncStateOf(now), "pending");
    now.usage->sent = quorl::wearable::Selection{7, 1, 0, 0};
    EXPECT_EQ(syncStateOf(now), "synced");
}

TEST(SyncState, IsSyncingDuringASessionAlsoOfWhatWasSent) {
    EXPECT_EQ(syncStateOf(running(pending())), "syncing");
    EXPECT_EQ(syncStateOf(running(sent())), "syncing");
}

TEST(SyncState, IsOffWithoutAPlaylistAlsoWhileASessionEnds) {
    EXPECT_EQ(syncStateOf({}), "off");
    auto now = running(pending());
    now.revision.reset();
    EXPECT_EQ(syncStateOf(now), "off");
    now = running(pending());
    now.choices.isSyncEnabled = false;
    EXPECT_EQ(syncStateOf(now), "off");
}

TEST(SyncState, IsUnknownUntilTheMusicFolderWasReadButOnlyWhereThatMatters) {
    auto now = pending();
    now.isMusicRead = false;
    EXPECT_EQ(syncStateOf(now), "unknown");
    EXPECT_EQ(syncStateOf(running(now)), "unknown");
    now.choices.playlist.reset();
    EXPECT_EQ(syncStateOf(now), "off");
}

} // namespace
