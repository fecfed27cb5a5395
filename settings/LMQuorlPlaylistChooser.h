#pragma once

#include "platform/Dispatch.h"
#include "platform/MediaLibrary.h"
#include "settings/LMQuorlDetailController.h"

/// The pane behind "Synced Playlist": the library's ordinary playlists and "None", with a checkmark
/// and the state of the sync on the chosen one. A tap writes the choice to the sync preferences.
/// Main thread only.
class LMQuorlPlaylistChooser : public LMQuorlDetailController {
  public:
    ~LMQuorlPlaylistChooser() override;

    [[nodiscard]] bool init() override;
    [[nodiscard]] std::string localizedPaneTitle();
    void viewWillAppear(bool animated) override;
    void viewDidDisappear(bool animated) override;

    [[nodiscard]] NSInteger numberOfSectionsInTableView(UITableView& tableView) override;
    [[nodiscard]] NSInteger tableView_numberOfRowsInSection(UITableView& tableView,
                                                            NSInteger section) override;

    /// The playlist of a row of the first section, which is one that the table has; null before the
    /// list was read and for a library without music.
    [[nodiscard]] std::shared_ptr<MPMediaPlaylist> playlistAtPath(const NSIndexPath& path) const;

    [[nodiscard]] std::shared_ptr<UITableViewCell>
    tableView_cellForRowAtIndexPath(UITableView& tableView, const NSIndexPath& path) override;
    void tableView_didSelectRowAtIndexPath(UITableView& tableView,
                                           const NSIndexPath& path) override;

    [[nodiscard]] PSController* parentController() const override { return _parentController; }

    void setParentController(PSController* controller) override { _parentController = controller; }

    [[nodiscard]] PSRootController* rootController() const override { return _rootController; }

    void setRootController(PSRootController* controller) override { _rootController = controller; }

    [[nodiscard]] std::shared_ptr<PSSpecifier> specifier() const override { return _specifier; }

    void setSpecifier(std::shared_ptr<PSSpecifier> specifier) override {
        _specifier = std::move(specifier);
    }

  protected:
    void _reloadData() override;

  private:
    void _mediaLibraryDidChangeNotification(const NSNotification& notification);
    void _quorlSyncStatusDidChangeNotification(const NSNotification& notification);
    void _syncPreferencesDidChangeNotification(const NSNotification& notification);
    void _scheduleDelayedSyncStatusUpdate();
    void _stopDelayedSyncStatusUpdateTimer();
    void _performDelayedSyncStatusUpdate();
    void _updateSelectedCellSyncStatus(UITableViewCell& cell) const;
    [[nodiscard]] std::optional<std::string> _syncStatusText() const;
    void _selectNone(UITableView& tableView, const NSIndexPath& path);
    void _selectPlaylist(UITableView& tableView, const NSIndexPath& path);

    NSArray<MPMediaPlaylist> _playlists;
    std::shared_ptr<NSNumber> _lastFullySyncedPlaylistID;
    bool _waitingForLastSyncSessionToFinish = false;
    dispatch_source_ref _deferredUIUpdateTimerSource;
    bool _deferredUIUpdateTimerScheduled = false;
    PSController* _parentController = nullptr;
    PSRootController* _rootController = nullptr;
    std::shared_ptr<PSSpecifier> _specifier;
};
