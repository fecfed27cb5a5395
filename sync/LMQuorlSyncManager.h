#pragma once

#include "platform/SyncSessions.h"

/// How far the sync of the chosen playlist is.
enum LMQuorlSyncStage : NSInteger {
    /// No synced playlist, or the synced playlist was sent in full as it is now.
    LMQuorlSyncStageIdle = 0,
    /// The synced playlist differs from the one last sent in full, and nothing is running.
    LMQuorlSyncStagePending = 1,
    /// Something is running, but no running asset task knows yet how many items it has.
    LMQuorlSyncStageIndeterminateSyncing = 2,
    /// Running asset tasks have items to send.
    LMQuorlSyncStageSyncing = 3,
};

/// Items over all asset tasks of all sessions.
struct LMQuorlSyncManagerAssetCounts {
    NSUInteger completed;
    NSUInteger total;
};

/// Posted on the main queue, with the manager as object: once when the manager is made, once for
/// each change of the list of sessions or of the sync preferences, and once for each event of an
/// observed session, except that a task has begun. Nothing else causes one: what a change of the
/// media library does to the answers is not announced here.
extern const NSNotificationName LMQuorlSyncStatusDidChangeNotification;

/// How far music sync has got: answers computed at each request from the platform's sync sessions
/// and the sync preferences. One for the process, made at first use and never destroyed. The
/// answers are for the main thread; session callbacks may come on any.
class LMQuorlSyncManager : public NSObject, public DVSessionObserver {
  public:
    /// The one manager. The first call, which makes it, is for the main thread; later ones may come
    /// on any.
    [[nodiscard]] static const std::shared_ptr<LMQuorlSyncManager>& sharedManager();

    [[nodiscard]] bool init() override;

    /// The mean of all asset tasks' progress; 1 where there is no session or every one has
    /// finished, 0 where there is no asset task. Not clamped.
    [[nodiscard]] float progress() const;

    /// Each computes the counts anew.
    [[nodiscard]] NSUInteger completedAssetCount() const;
    [[nodiscard]] NSUInteger totalAssetCount() const;

    [[nodiscard]] LMQuorlSyncStage syncStage() const;

    void sessionWillBegin(DVSession& session) override;
    void sessionDidFinish(DVSession& session) override;
    void session_willBeginSessionTask(DVSession& session, DVSessionTask& task) override;
    void session_didFinishSessionTask(DVSession& session, DVSessionTask& task) override;
    void session_didUpdateSessionTask(DVSession& session, DVSessionTask& task) override;

  private:
    void _applicationDidEnterBackgroundNotification(const NSNotification& notification);
    void _applicationWillEnterForegroundNotification(const NSNotification& notification);
    [[nodiscard]] LMQuorlSyncManagerAssetCounts _assetCounts() const;
    void _postSyncStatusDidChangeNotification();
    void _drovanSessionsDidChangeNotification(const NSNotification& notification);
    void _syncPreferencesDidChangeNotification(const NSNotification& notification);
    void _startObservingSyncSessions();
    void _stopObservingSyncSessions();
    void _updateSyncSessions();

    NSArray<DVSession> _observedDeviceSyncSessions;
};
