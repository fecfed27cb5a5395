#include <gmock/gmock.h>

#include "runtime/lists/NavigationController.h"
#include "settings/LMQuorlPlaylistChooser.h"
#include "settings/LMQuorlSettingsController.h"
#include "sync/LMQuorlSyncManager.h"
#include "tests/support/MainQueueRun.h"
#include "tests/support/TestHost.h"

namespace {

using quorl::tests::runMainQueueUntil;
using quorl::tests::runQueuedWork;
using quorl::tests::TestHost;

/// The other tests of the panes replace libdispatch; this one shows once that the road from a
/// preference that another process changed to the refresh of both panes leads through it, too.
TEST(RealTime, BringsAChangeElsewhereToThePanes) {
    const auto host = TestHost::installed();
    (void)LMQuorlSyncManager::sharedManager();
    const auto pane = create<LMQuorlSettingsController>();
    (void)pane->specifiers();
    const auto chooser = create<LMQuorlPlaylistChooser>();
    runQueuedWork();
    host->journal.clear();

    (void)host->preferences.setValue(quorl::SyncPreference::AssetSyncEnabled, 1);
    quorl::SyncDefaults::announceChange();
    runMainQueueUntil([&journal = host->journal] {
        return journal.count("row Synced Playlist") > 0 && journal.count("table") > 0;
    });

    EXPECT_EQ(host->journal.count("row Synced Playlist"), 1U);
    EXPECT_EQ(host->journal.count("table"), 1U);
}

} // namespace
