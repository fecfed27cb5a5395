#include "settings/LMQuorlPlaylistChooser.h"

#include <algorithm>
#include <array>

#include "platform/HostApp.h"
#include "platform/LocalizedText.h"
#include "platform/SyncPreferences.h"
#include "settings/LMQuorlPlaylistCell.h"
#include "sync/LMQuorlSyncManager.h"
#include "sync/LMSyncDefaults+Extras.h"

namespace {

constexpr NSUInteger musicMediaTypes = MPMediaTypeMusic | MPMediaTypeMusicVideo;
constexpr std::int64_t updateDelay = 1'500'000'000; // nanoseconds
constexpr std::uint64_t updateLeeway = 150'000'000; // nanoseconds
constexpr const char* cellIdentifier = "PC";

enum Section : NSInteger { PlaylistSection = 0, NoneSection = 1 };

constexpr LocalizedText titleText{"SYNC_SETTINGS_PLAYLIST_PICKER_TITLE", "Synced Playlist"};
constexpr LocalizedText noneText{"SYNC_SETTINGS_PLAYLIST_PICKER_NONE", "None"};
constexpr LocalizedText syncedText{"SYNC_SETTINGS_PLAYLIST_SYNC_STATUS_SYNCED", "Synced"};
constexpr LocalizedText pendingText{"SYNC_SETTINGS_PLAYLIST_SYNC_STATUS_SYNC_PENDING",
                                    "Sync Pending…"};
constexpr LocalizedText indeterminateText{
    "SYNC_SETTINGS_PLAYLIST_SYNC_STATUS_INDETERMINATE_SYNCING", "Syncing…"};
constexpr LocalizedText syncingText{"SYNC_SETTINGS_PLAYLIST_SYNC_STATUS_SYNCING", "%tu%% Synced…"};

// By stage, from LMQuorlSyncStageIdle on.
constexpr std::array stageTexts{syncedText, pendingText, indeterminateText, syncingText};

/// From 1 to 99: a sync that has begun shows that it has, and one that has not ended never 100.
NSUInteger syncedPercent() {
    const float progress = LMQuorlSyncManager::sharedManager()->progress();
    const auto percent = NSSaturatingTruncate<NSUInteger>(static_cast<double>(progress) * 100.0);
    return std::clamp<NSUInteger>(percent, 1, 99);
}

void clearState(const UITableView& tableView, NSInteger row) {
    const auto path = NSIndexPath::indexPathForRow_inSection(row, PlaylistSection);
    if (const auto cell = tableView.cellForRowAtIndexPath(path)) {
        cell->setAccessoryType(UITableViewCellAccessoryType::None);
        cell->detailTextLabel().setText(std::nullopt);
    }
}

void setAccessory(const UITableView& tableView, const NSIndexPath& path,
                  UITableViewCellAccessoryType type) {
    if (const auto cell = tableView.cellForRowAtIndexPath(path)) {
        cell->setAccessoryType(type);
    }
}

void requireFalse(MPMediaQuery& query, MPMediaProperty property) {
    query.addFilterPredicate(
        MPMediaPropertyPredicate::predicateWithValue_forProperty_comparisonType(
            NSNumber::numberWithBool(false), property, MPMediaPredicateComparison::EqualTo));
}

/// Folders and what programs generated are left out.
NSArray<MPMediaPlaylist> ordinaryPlaylists() {
    if (!MPMediaLibrary::defaultMediaLibrary().hasMediaOfType(musicMediaTypes)) {
        return nullptr;
    }
    const auto query = MPMediaQuery::playlistsQuery();
    requireFalse(*query, MPMediaPlaylistPropertyIsFolder);
    requireFalse(*query, MPMediaPlaylistPropertyIsAugurMix);
    requireFalse(*query, MPMediaPlaylistPropertyIsAugurPlaylist);
    return query->collections();
}

} // namespace

bool LMQuorlPlaylistChooser::init() {
    if (!initWithStyle(UITableViewStyle::Grouped)) {
        return false;
    }
    using Self = LMQuorlPlaylistChooser;
    using Handler = NSNotificationSelector;
    setTitle(localizedPaneTitle());
    _lastFullySyncedPlaylistID =
        LMSyncDefaults::sharedDefaults().lastFullySentAssetSyncPlaylistPersistentID();
    NSNotificationCenter& center = NSNotificationCenter::defaultCenter();
    center.addObserver_selector_name_object(this,
                                            Handler::of<&Self::_mediaLibraryDidChangeNotification>(
                                                "_mediaLibraryDidChangeNotification:"),
                                            MPMediaLibraryDidChangeNotification, nullptr);
    center.addObserver_selector_name_object(
        this,
        Handler::of<&Self::_quorlSyncStatusDidChangeNotification>(
            "_quorlSyncStatusDidChangeNotification:"),
        LMQuorlSyncStatusDidChangeNotification, nullptr);
    center.addObserver_selector_name_object(
        this,
        Handler::of<&Self::_syncPreferencesDidChangeNotification>(
            "_syncPreferencesDidChangeNotification:"),
        LMSyncPreferencesDidChangeNotification, nullptr);
    return true;
}

LMQuorlPlaylistChooser::~LMQuorlPlaylistChooser() {
    if (_deferredUIUpdateTimerSource) {
        dispatch_source_cancel(_deferredUIUpdateTimerSource.get());
        _deferredUIUpdateTimerSource = nullptr;
    }
    NSNotificationCenter::defaultCenter().removeObserver(this);
}

std::string LMQuorlPlaylistChooser::localizedPaneTitle() { return localized(*this, titleText); }

void LMQuorlPlaylistChooser::_mediaLibraryDidChangeNotification(
    const NSNotification& /*notification*/) {
    _reloadData();
}

void LMQuorlPlaylistChooser::_quorlSyncStatusDidChangeNotification(
    const NSNotification& /*notification*/) {
    _scheduleDelayedSyncStatusUpdate();
}

void LMQuorlPlaylistChooser::_syncPreferencesDidChangeNotification(
    const NSNotification& /*notification*/) {
    const auto current =
        LMSyncDefaults::sharedDefaults().lastFullySentAssetSyncPlaylistPersistentID();
    if (current == _lastFullySyncedPlaylistID ||
        (current && current->isEqual(_lastFullySyncedPlaylistID.get()))) {
        return;
    }
    _lastFullySyncedPlaylistID = current;
    _reloadData();
}

void LMQuorlPlaylistChooser::_reloadData() {
    _playlists = ordinaryPlaylists();
    tableView().reloadData();
}

void LMQuorlPlaylistChooser::_scheduleDelayedSyncStatusUpdate() {
    if (_deferredUIUpdateTimerScheduled) {
        return;
    }
    if (!_deferredUIUpdateTimerSource) {
        _deferredUIUpdateTimerSource = dispatch_take_source(
            dispatch_source_create(DISPATCH_SOURCE_TYPE_TIMER, 0, 0, dispatch_get_main_queue()));
        // Held weakly: an armed timer keeps no chooser alive.
        dispatch_source_set_event_handler(_deferredUIUpdateTimerSource.get(),
                                          [reference = weak(this)] {
                                              if (const auto self = reference.lock()) {
                                                  self->_performDelayedSyncStatusUpdate();
                                              }
                                          });
        dispatch_resume(_deferredUIUpdateTimerSource.get());
    }
    dispatch_source_set_timer(_deferredUIUpdateTimerSource.get(),
                              dispatch_time(DISPATCH_TIME_NOW, updateDelay), DISPATCH_TIME_FOREVER,
                              updateLeeway);
    _deferredUIUpdateTimerScheduled = true;
}

void LMQuorlPlaylistChooser::_stopDelayedSyncStatusUpdateTimer() {
    _deferredUIUpdateTimerScheduled = false;
    if (_deferredUIUpdateTimerSource) {
        dispatch_source_set_timer(_deferredUIUpdateTimerSource.get(), DISPATCH_TIME_FOREVER, 0, 0);
    }
}

void LMQuorlPlaylistChooser::_performDelayedSyncStatusUpdate() {
    _waitingForLastSyncSessionToFinish = false;
    _stopDelayedSyncStatusUpdateTimer();
    _reloadData();
}

void LMQuorlPlaylistChooser::viewWillAppear(bool animated) {
    LMQuorlDetailController::viewWillAppear(animated);
    _reloadData();
    MPMediaLibrary::defaultMediaLibrary().beginGeneratingLibraryChangeNotifications();
}

void LMQuorlPlaylistChooser::viewDidDisappear(bool animated) {
    LMQuorlDetailController::viewDidDisappear(animated);
    MPMediaLibrary::defaultMediaLibrary().endGeneratingLibraryChangeNotifications();
}

NSInteger LMQuorlPlaylistChooser::numberOfSectionsInTableView(UITableView& /*tableView*/) {
    return 2;
}

NSInteger LMQuorlPlaylistChooser::tableView_numberOfRowsInSection(UITableView& /*tableView*/,
                                                                  NSInteger section) {
    switch (section) {
    case PlaylistSection:
        return static_cast<NSInteger>(elements(_playlists).size());
    case NoneSection:
        return 1;
    default:
        return -1;
    }
}

std::shared_ptr<MPMediaPlaylist>
LMQuorlPlaylistChooser::playlistAtPath(const NSIndexPath& path) const {
    return _playlists ? (*_playlists)[static_cast<std::size_t>(path.row)] : nullptr;
}

void LMQuorlPlaylistChooser::_updateSelectedCellSyncStatus(UITableViewCell& cell) const {
    cell.detailTextLabel().setText(_syncStatusText());
}

std::optional<std::string> LMQuorlPlaylistChooser::_syncStatusText() const {
    if (_waitingForLastSyncSessionToFinish) {
        return localized(*this, pendingText);
    }
    const NSInteger stage = LMQuorlSyncManager::sharedManager()->syncStage();
    if (stage < 0 || stage >= static_cast<NSInteger>(stageTexts.size())) {
        return std::nullopt;
    }
    const LocalizedText& text = stageTexts[static_cast<std::size_t>(stage)];
    if (stage != LMQuorlSyncStageSyncing) {
        return localized(*this, text);
    }
    const NSUInteger percent = syncedPercent();
    return NSString::localizedStringWithFormat(localized(*this, text), {percent});
}

std::shared_ptr<UITableViewCell>
LMQuorlPlaylistChooser::tableView_cellForRowAtIndexPath(UITableView& tableView,
                                                        const NSIndexPath& path) {
    auto cell = tableView.dequeueReusableCellWithIdentifier(cellIdentifier);
    if (!cell) {
        cell = create<LMQuorlPlaylistCell>(&LMQuorlPlaylistCell::initWithStyle_reuseIdentifier,
                                           UITableViewCellStyle::Value1, cellIdentifier);
        if (const auto color = PSListController::appearance().textColor) {
            cell->textLabel().setTextColor(color);
        }
        cell->setTintColor(QPSQuorlTintColor());
    }
    LMSyncDefaults& defaults = LMSyncDefaults::sharedDefaults();
    const bool isSyncOn = defaults.isAssetSyncEnabled();
    if (path.section != PlaylistSection) {
        cell->textLabel().setText(localized(*this, noneText));
        cell->detailTextLabel().setText(std::nullopt);
        cell->setAccessoryType(isSyncOn ? UITableViewCellAccessoryType::None
                                        : UITableViewCellAccessoryType::Checkmark);
        return cell;
    }
    const auto playlist = playlistAtPath(path);
    cell->textLabel().setText(playlist->name());
    const auto synced = assetSyncPlaylist(LMSyncDefaults::sharedDefaults());
    if (synced && isSyncOn && synced->persistentID() == playlist->persistentID()) {
        cell->setAccessoryType(UITableViewCellAccessoryType::Checkmark);
        _updateSelectedCellSyncStatus(*cell);
    } else {
        cell->setAccessoryType(UITableViewCellAccessoryType::None);
        cell->detailTextLabel().setText(std::nullopt);
    }
    return cell;
}

void LMQuorlPlaylistChooser::tableView_didSelectRowAtIndexPath(UITableView& tableView,
                                                               const NSIndexPath& path) {
    if (path.section == NoneSection) {
        _selectNone(tableView, path);
    } else {
        _selectPlaylist(tableView, path);
    }
    tableView.deselectRowAtIndexPath_animated(path, true);
}

void LMQuorlPlaylistChooser::_selectNone(UITableView& tableView, const NSIndexPath& path) {
    LMSyncDefaults::sharedDefaults().setAssetSyncEnabled(false);
    setAccessory(tableView, path, UITableViewCellAccessoryType::Checkmark);
    for (NSInteger row = 0; row < static_cast<NSInteger>(elements(_playlists).size()); ++row) {
        clearState(tableView, row);
    }
}

void LMQuorlPlaylistChooser::_selectPlaylist(UITableView& tableView, const NSIndexPath& path) {
    LMSyncDefaults& defaults = LMSyncDefaults::sharedDefaults();
    const auto playlist = playlistAtPath(path);
    const auto current = assetSyncPlaylist(defaults);
    const bool isOther = playlist->persistentID() != (current ? current->persistentID() : 0);
    if (isOther && LMQuorlSyncManager::sharedManager()->syncStage() != LMQuorlSyncStageIdle) {
        // What was armed before the switch still speaks of the old choice.
        _waitingForLastSyncSessionToFinish = true;
        _stopDelayedSyncStatusUpdateTimer();
    }
    defaults.setAssetSyncEnabled(true);
    setAssetSyncPlaylist(defaults, playlist);
    setAccessory(tableView, NSIndexPath::indexPathForRow_inSection(0, NoneSection),
                 UITableViewCellAccessoryType::None);
    const auto playlists = _playlists;
    NSInteger row = 0;
    for (const auto& other : elements(playlists)) {
        if (other != playlist) {
            clearState(tableView, row);
        }
        ++row;
    }
    if (const auto cell = tableView.cellForRowAtIndexPath(path)) {
        cell->setAccessoryType(UITableViewCellAccessoryType::Checkmark);
        _updateSelectedCellSyncStatus(*cell);
    }
}
