#include "sync/LMQuorlSyncManager.h"

#include "platform/Dispatch.h"
#include "platform/UserInterface.h"
#include "sync/LMSyncDefaults+Extras.h"

const NSNotificationName LMQuorlSyncStatusDidChangeNotification =
    "LMQuorlSyncStatusDidChangeNotification";

namespace {

/// A value that is missing on either side counts as a difference.
bool areSame(const std::shared_ptr<NSObject>& left, const std::shared_ptr<NSObject>& right) {
    return left && right && left->isEqual(right.get());
}

/// The stage while nothing is running: whether what was last sent in full is what is chosen now.
LMQuorlSyncStage stageOfPreferences() {
    LMSyncDefaults& defaults = LMSyncDefaults::sharedDefaults();
    const auto playlist = assetSyncPlaylist(defaults);
    const auto persistentID = defaults.assetSyncPlaylistPersistentID();
    const auto revision =
        playlist ? playlist->valueForProperty(MPMediaEntityPropertyEntityRevision) : nullptr;
    const auto sentPersistentID = defaults.lastFullySentAssetSyncPlaylistPersistentID();
    const auto sentVersion = defaults.lastFullySentAssetSyncPlaylistVersion();
    const bool isSent = areSame(persistentID, sentPersistentID) && areSame(revision, sentVersion);
    return !playlist || isSent ? LMQuorlSyncStageIdle : LMQuorlSyncStagePending;
}

} // namespace

const std::shared_ptr<LMQuorlSyncManager>& LMQuorlSyncManager::sharedManager() {
    static dispatch_once_t once;
    // Constant from the start, for an initialiser would bring a lock of its own beside `once`; what
    // it comes to point to is never destroyed.
    constinit static const std::shared_ptr<LMQuorlSyncManager>* manager = nullptr;
    dispatch_once(&once, [] {
        manager = new std::shared_ptr<LMQuorlSyncManager>(::create<LMQuorlSyncManager>());
    });
    return *manager;
}

bool LMQuorlSyncManager::init() {
    if (!NSObject::init()) {
        return false;
    }
    using Self = LMQuorlSyncManager;
    using Handler = NSNotificationSelector;
    NSNotificationCenter& center = NSNotificationCenter::defaultCenter();
    center.addObserver_selector_name_object(
        this,
        Handler::of<&Self::_applicationDidEnterBackgroundNotification>(
            "_applicationDidEnterBackgroundNotification:"),
        UIApplicationDidEnterBackgroundNotification, nullptr);
    center.addObserver_selector_name_object(
        this,
        Handler::of<&Self::_applicationWillEnterForegroundNotification>(
            "_applicationWillEnterForegroundNotification:"),
        UIApplicationWillEnterForegroundNotification, nullptr);
    center.addObserver_selector_name_object(
        this,
        Handler::of<&Self::_drovanSessionsDidChangeNotification>(
            "_drovanSessionsDidChangeNotification:"),
        DVSessionsDidChangeNotification, nullptr);
    center.addObserver_selector_name_object(
        this,
        Handler::of<&Self::_syncPreferencesDidChangeNotification>(
            "_syncPreferencesDidChangeNotification:"),
        LMSyncPreferencesDidChangeNotification, nullptr);
    _updateSyncSessions();
    return true;
}

float LMQuorlSyncManager::progress() const {
    if (elements(_observedDeviceSyncSessions).empty()) {
        return 1.0F;
    }
    bool allFinished = true;
    double sum = 0.0;
    NSUInteger count = 0;
    for (const auto& session : elements(_observedDeviceSyncSessions)) {
        allFinished = session->isFinished() && allFinished;
        const auto tasks =
            session->sessionTasksWithGroupingKey(DVDeviceSyncSessionAssetTaskGroupingKey);
        for (const auto& task : elements(tasks)) {
            sum += task->progress();
            ++count;
        }
    }
    if (allFinished) {
        return 1.0F;
    }
    return count == 0 ? 0.0F : static_cast<float>(sum / static_cast<double>(count));
}

NSUInteger LMQuorlSyncManager::completedAssetCount() const { return _assetCounts().completed; }

NSUInteger LMQuorlSyncManager::totalAssetCount() const { return _assetCounts().total; }

void LMQuorlSyncManager::_applicationDidEnterBackgroundNotification(
    const NSNotification& /*notification*/) {
    _stopObservingSyncSessions();
}

void LMQuorlSyncManager::_applicationWillEnterForegroundNotification(
    const NSNotification& /*notification*/) {
    _startObservingSyncSessions();
}

LMQuorlSyncManagerAssetCounts LMQuorlSyncManager::_assetCounts() const {
    LMQuorlSyncManagerAssetCounts counts{0, 0};
    for (const auto& session : elements(_observedDeviceSyncSessions)) {
        const auto tasks =
            session->sessionTasksWithGroupingKey(DVDeviceSyncSessionAssetTaskGroupingKey);
        for (const auto& task : elements(tasks)) {
            counts.completed += task->completedItemCount();
            counts.total += task->totalItemCount();
        }
    }
    return counts;
}

void LMQuorlSyncManager::_postSyncStatusDidChangeNotification() {
    dispatch_async(dispatch_get_main_queue(), [self = strong(this)] {
        NSNotificationCenter::defaultCenter().postNotificationName_object(
            LMQuorlSyncStatusDidChangeNotification, self.get());
    });
}

void LMQuorlSyncManager::_drovanSessionsDidChangeNotification(
    const NSNotification& /*notification*/) {
    _updateSyncSessions();
}

void LMQuorlSyncManager::_syncPreferencesDidChangeNotification(
    const NSNotification& /*notification*/) {
    _postSyncStatusDidChangeNotification();
}

void LMQuorlSyncManager::_startObservingSyncSessions() {
    const auto sessions = _observedDeviceSyncSessions;
    for (const auto& session : elements(sessions)) {
        session->addObserver(strong(this));
    }
}

void LMQuorlSyncManager::_stopObservingSyncSessions() {
    const auto sessions = _observedDeviceSyncSessions;
    for (const auto& session : elements(sessions)) {
        session->removeObserver(strong(this));
    }
}

void LMQuorlSyncManager::_updateSyncSessions() {
    _stopObservingSyncSessions();
    _observedDeviceSyncSessions =
        DVSession::sessionsWithSessionTypeIdentifier(DVSessionTypeDeviceSync);
    _startObservingSyncSessions();
    _postSyncStatusDidChangeNotification();
}

LMQuorlSyncStage LMQuorlSyncManager::syncStage() const {
    bool isRunning = false;
    bool isAssetTaskRunning = false;
    NSUInteger runningAssets = 0;
    for (const auto& session : elements(_observedDeviceSyncSessions)) {
        const auto tasks = session->sessionTasks();
        for (const auto& task : elements(tasks)) {
            if (!task->isRunning()) {
                continue;
            }
            isRunning = true;
            if (task->sessionGroupingKey() == DVDeviceSyncSessionAssetTaskGroupingKey) {
                runningAssets += task->totalItemCount();
                isAssetTaskRunning = true;
            }
        }
    }
    if (isAssetTaskRunning && runningAssets != 0) {
        return LMQuorlSyncStageSyncing;
    }
    return isRunning ? LMQuorlSyncStageIndeterminateSyncing : stageOfPreferences();
}

void LMQuorlSyncManager::sessionWillBegin(DVSession& /*session*/) {
    _postSyncStatusDidChangeNotification();
}

void LMQuorlSyncManager::sessionDidFinish(DVSession& /*session*/) {
    _postSyncStatusDidChangeNotification();
}

void LMQuorlSyncManager::session_willBeginSessionTask(DVSession& /*session*/,
                                                      DVSessionTask& /*task*/) {
    _postSyncStatusDidChangeNotification();
}

void LMQuorlSyncManager::session_didFinishSessionTask(DVSession& /*session*/,
                                                      DVSessionTask& /*task*/) {
    _postSyncStatusDidChangeNotification();
}

void LMQuorlSyncManager::session_didUpdateSessionTask(DVSession& /*session*/,
                                                      DVSessionTask& /*task*/) {
    _postSyncStatusDidChangeNotification();
}
