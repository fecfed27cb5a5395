#include "quorl-syncd/engine/SyncState.h"

#include <gtest/gtest.h>

namespace {

using namespace quorl::syncd;

constexpr SyncFacts waiting{.isWished = true, .isLibraryRead = true, .isPlaylistThere = true};

SyncFacts with(bool SyncFacts::*fact, bool value, SyncFacts facts = waiting) {
    facts.*fact = value;
    return facts;
}

TEST(SyncState, IsPendingAsLongAsThePlaylistWasNotSent) {
    EXPECT_STREQ(syncStateOf(waiting), "pending");
}

TEST(SyncState, IsSyncedWhenThePlaylistWasSentAsItIsNow) {
    EXPECT_STREQ(syncStateOf(with(&SyncFacts::isSent, true)), "synced");
}

TEST(SyncState, IsSyncingDuringASessionAlsoOfWhatWasSent) {
    const auto running = with(&SyncFacts::isRunning, true);
    EXPECT_STREQ(syncStateOf(running), "syncing");
    EXPECT_STREQ(syncStateOf(with(&SyncFacts::isSent, true, running)), "syncing");
}

TEST(SyncState, IsOffWithoutAPlaylistAlsoWhileASessionEnds) {
    EXPECT_STREQ(syncStateOf({}), "off");
    EXPECT_STREQ(syncStateOf(with(&SyncFacts::isWished, false)), "off");
    EXPECT_STREQ(syncStateOf(with(&SyncFacts::isPlaylistThere, false)), "off");
    const auto running = with(&SyncFacts::isRunning, true);
    EXPECT_STREQ(syncStateOf(with(&SyncFacts::isWished, false, running)), "off");
}

TEST(SyncState, IsUnknownUntilTheMusicFolderWasReadButOnlyWhereThatMatters) {
    const SyncFacts unread{.isWished = true};
    EXPECT_STREQ(syncStateOf(unread), "unknown");
    EXPECT_STREQ(syncStateOf(with(&SyncFacts::isRunning, true, unread)), "unknown");
    EXPECT_STREQ(syncStateOf(with(&SyncFacts::isLibraryRead, false, {})), "off");
}

} // namespace
