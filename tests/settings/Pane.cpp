#include "tests/settings/Pane.h"

#include <algorithm>

#include "runtime/lists/ListView.h"
#include "runtime/plugins/StringTable.h"
#include "sync/LMQuorlSyncManager.h"

namespace quorl::tests {

namespace {

ListView::Row rowOf(const NavigationController& navigation, const std::string& title) {
    auto& list = dynamic_cast<PSListController&>(*navigation.top());
    draw(list);
    const auto& rows = ListView::of(list).rows();
    const auto found = std::find_if(rows.begin(), rows.end(), [&title](const ListView::Row& row) {
        return row.specifier->name() == title;
    });
    if (found == rows.end()) {
        throw std::runtime_error("no row " + title + " is shown");
    }
    return *found;
}

} // namespace

std::shared_ptr<PaneHost> PaneHost::installed() {
    auto host = std::make_shared<PaneHost>();
    install(host);
    return host;
}

std::optional<std::string> PaneHost::textForKey(const StringTable& table, const std::string& key,
                                                const std::optional<std::string>& value) {
    EXPECT_EQ(table.text({"en"}, StringTable::defaultDomain, key), value);
    return TestHost::textForKey(table, key, value);
}

PaneTest::PaneTest() : morning_(host_->mediaLibrary().addPlaylist(7, "Morning")) {
    morning_->setRevision(1);
}

void PaneTest::showPane() {
    (void)LMQuorlSyncManager::sharedManager();
    drain(); // the manager's first status, which would set off a refresh
    pane_ = ::create<LMQuorlSettingsController>();
    navigation_->setRootPane(pane_);
    (void)pane_->specifiers();
    navigation_->appear(false);
    draw(*pane_);
    host_->journal.clear();
}

std::shared_ptr<PSSpecifier> PaneTest::specifier(const std::string& title) {
    return rowOf(*navigation_, title).specifier;
}

void PaneTest::tap(const std::string& title) {
    ASSERT_TRUE(navigation_->open(specifier(title)));
    draw(*navigation_->top());
}

std::optional<std::string> PaneTest::shownValue(const std::string& title) {
    return rowOf(*navigation_, title).value;
}

std::optional<std::string> PaneTest::shownFooter(const std::string& title) {
    return rowOf(*navigation_, title).footer;
}

void PaneTest::chooseMorning() {
    store(SyncPreference::AssetSyncEnabled, 1);
    store(SyncPreference::AssetSyncPlaylistPersistentID, 7);
}

void PaneTest::sendMorning() {
    store(SyncPreference::LastFullySentAssetSyncPlaylistPersistentID, 7);
    store(SyncPreference::LastFullySentAssetSyncPlaylistVersion, 1);
}

std::shared_ptr<TaskDouble> PaneTest::beginSync(NSUInteger total, double progress) {
    auto task = host_->sessionService.add("sync")->addAssetTask(
        {.isRunning = true, .total = total, .progress = progress});
    post(DVSessionsDidChangeNotification);
    return task;
}

void PaneTest::beginPreparation() {
    host_->sessionService.add("sync")->addOtherTask({.isRunning = true});
    post(DVSessionsDidChangeNotification);
}

void PaneTest::endSync() {
    host_->sessionService.replace({});
    post(DVSessionsDidChangeNotification);
}

void PaneTest::postStatus() {
    NSNotificationCenter::defaultCenter().postNotificationName_object(
        LMQuorlSyncStatusDidChangeNotification, LMQuorlSyncManager::sharedManager().get());
}

} // namespace quorl::tests
