#include "settings/LMQuorlSettingsController.h"

#include "platform/Dispatch.h"
#include "platform/LocalizedText.h"
#include "platform/MediaLibrary.h"
#include "platform/SizeFormatter.h"
#include "platform/SyncPreferences.h"
#include "settings/LMQuorlLimitChooser.h"
#include "settings/LMQuorlPlaylistChooser.h"
#include "settings/LMSyncLimitType.h"
#include "sync/LMQuorlSyncManager.h"
#include "sync/LMSyncDefaults+Extras.h"

QUORL_EXPORT_CLASS(LMQuorlSettingsController)

namespace {

constexpr NSUInteger musicMediaTypes = MPMediaTypeMusic | MPMediaTypeMusicVideo;
constexpr std::int64_t deferredUpdateDelay = 1'500'000'000; // nanoseconds
constexpr const char* musicAppIdentifier = "org.quorl.velora.music";

constexpr LocalizedText titleText{"SYNC_SETTINGS_ROOT_TITLE", "Music"};
constexpr LocalizedText playlistSectionText{"SYNC_SETTINGS_PLAYLIST_SECTION_TITLE",
                                            "Music Syncing"};
constexpr LocalizedText footerDescriptionText{
    "SYNC_SETTINGS_FOOTER_DESCRIPTION",
    "This playlist syncs when Velora is on its charger. Once it's synced, this playlist will be "
    "available on Velora even when it's out of range of your Zanthe."};
constexpr LocalizedText playlistCellText{"SYNC_SETTINGS_PLAYLIST_CELL_LABEL", "Synced Playlist"};
constexpr LocalizedText limitSectionText{"SYNC_SETTINGS_USAGE_LIMIT_SECTION_TITLE",
                                         "Music Storage"};
constexpr LocalizedText limitCellText{"SYNC_SETTINGS_USAGE_LIMIT_CELL_LABEL", "Playlist Limit"};
constexpr LocalizedText noPlaylistText{"SYNC_SETTINGS_PLAYLIST_CELL_VALUE_TEXT_NO_PLAYLIST",
                                       "None"};
constexpr LocalizedText syncPendingText{"SYNC_SETTINGS_PLAYLIST_CELL_VALUE_TEXT_SYNC_PENDING",
                                        "Sync Pending…"};
constexpr LocalizedText syncingText{"SYNC_SETTINGS_PLAYLIST_CELL_VALUE_TEXT_SYNCING", "Syncing…"};
constexpr LocalizedText songsText{"SYNC_SETTINGS_USAGE_LIMIT_TYPE_N_SONGS", "%tu Songs"};

std::shared_ptr<PSSpecifier> makeGroup(std::string title) {
    return PSSpecifier::preferenceSpecifierNamed_target_set_get_detail_cell_edit(
        std::move(title), nullptr, std::nullopt, std::nullopt, std::nullopt, PSCellType::Group,
        std::nullopt);
}

std::shared_ptr<PSSpecifier> makeRow(std::string title, const std::shared_ptr<NSObject>& target,
                                     PSGetter getter, Class detail) {
    return PSSpecifier::preferenceSpecifierNamed_target_set_get_detail_cell_edit(
        std::move(title), target, std::nullopt, getter, detail, PSCellType::LinkList, std::nullopt);
}

/// What a stage is called in place of the playlist's name; null where the name stands.
const LocalizedText* textOfStage(LMQuorlSyncStage stage) {
    switch (stage) {
    case LMQuorlSyncStageIndeterminateSyncing:
    case LMQuorlSyncStageSyncing:
        return &syncingText;
    case LMQuorlSyncStagePending:
        return &syncPendingText;
    case LMQuorlSyncStageIdle:
        break;
    }
    return nullptr;
}

} // namespace

bool LMQuorlSettingsController::init() {
    if (!QPSNotificationAppController::init()) {
        return false;
    }
    using Self = LMQuorlSettingsController;
    setTitle(localizedPaneTitle());
    NSNotificationCenter& center = NSNotificationCenter::defaultCenter();
    center.addObserver_selector_name_object(
        this, NSNotificationSelector::of<&Self::_updateUI>("_updateUI"),
        MPMediaLibraryDidChangeNotification, nullptr);
    const auto manager = LMQuorlSyncManager::sharedManager();
    center.addObserver_selector_name_object(
        this,
        NSNotificationSelector::of<&Self::_syncStatusDidChangeNotification>(
            "_syncStatusDidChangeNotification"),
        LMQuorlSyncStatusDidChangeNotification, manager.get());
    return true;
}

LMQuorlSettingsController::~LMQuorlSettingsController() {
    NSNotificationCenter::defaultCenter().removeObserver(this);
}

std::string LMQuorlSettingsController::localizedPaneTitle() { return localized(*this, titleText); }

std::shared_ptr<NSBundle> LMQuorlSettingsController::bundle() {
    return NSBundle::bundleForClass(Class::ofObject(*this));
}

std::optional<std::string> LMQuorlSettingsController::applicationBundleIdentifier() {
    return bundle()->bundleIdentifier();
}

NSArray<PSSpecifier> LMQuorlSettingsController::specifiers() {
    if (_specifiers) {
        return _specifiers;
    }
    using Self = LMQuorlSettingsController;
    const auto playlistGroup = makeGroup(localized(*this, playlistSectionText));
    playlistGroup->setProperty_forKey(localized(*this, footerDescriptionText),
                                      PSFooterTextGroupKey);
    _playlistSpecifier = makeRow(localized(*this, playlistCellText), strong(this),
                                 PSGetter::of<&Self::playlistName>("playlistName:"),
                                 Class::of<LMQuorlPlaylistChooser>());
    _limitGroupSpecifier = makeGroup(localized(*this, limitSectionText));
    _limitSpecifier =
        makeRow(localized(*this, limitCellText), strong(this), PSGetter::of<&Self::limit>("limit:"),
                Class::of<LMQuorlLimitChooser>());
    std::vector rows{playlistGroup, _playlistSpecifier, _limitGroupSpecifier, _limitSpecifier};
    if (const auto glance = glanceSpecifierForIdentifier(musicAppIdentifier)) {
        rows.insert(rows.begin(), glance);
    }
    _specifiers = std::make_shared<const std::vector<std::shared_ptr<PSSpecifier>>>(rows);
    return _specifiers;
}

void LMQuorlSettingsController::viewWillAppear(bool animated) {
    QPSNotificationAppController::viewWillAppear(animated);
    MPMediaLibrary::defaultMediaLibrary().beginGeneratingLibraryChangeNotifications();
    _updateUI();
}

void LMQuorlSettingsController::viewWillDisappear(bool animated) {
    QPSNotificationAppController::viewWillDisappear(animated);
    MPMediaLibrary::defaultMediaLibrary().endGeneratingLibraryChangeNotifications();
}

std::optional<std::string>
LMQuorlSettingsController::playlistName(const std::shared_ptr<PSSpecifier>& /*specifier*/) {
    if (!MPMediaLibrary::defaultMediaLibrary().hasMediaOfType(musicMediaTypes)) {
        return localized(*this, noPlaylistText);
    }
    const auto playlist = assetSyncPlaylist(LMSyncDefaults::sharedDefaults());
    if (!playlist) {
        return localized(*this, noPlaylistText);
    }
    const LocalizedText* stageText = textOfStage(LMQuorlSyncManager::sharedManager()->syncStage());
    const std::string status = stageText ? localized(*this, *stageText) : std::string();
    return status.empty() ? playlist->name() : status;
}

std::optional<std::string>
LMQuorlSettingsController::limit(const std::shared_ptr<PSSpecifier>& /*specifier*/) {
    const LMSyncDefaults& defaults = LMSyncDefaults::sharedDefaults();
    const NSUInteger type = defaults.assetSyncLimitType();
    const auto limit = defaults.assetSyncLimit();
    const NSUInteger amount = limit ? limit->unsignedIntegerValue() : 0;
    if (type == LMSyncLimitTypeSongs) {
        return NSString::localizedStringWithFormat(localized(*this, songsText), {amount});
    }
    return CPFSSizeStrings(static_cast<float>(amount << LMSyncLimitMegabyteShift));
}

void LMQuorlSettingsController::_syncStatusDidChangeNotification() { _scheduleDeferredUpdateUI(); }

void LMQuorlSettingsController::_scheduleDeferredUpdateUI() {
    if (_deferredUIUpdateScheduled) {
        return;
    }
    // Held weakly: a pending refresh keeps no dismissed pane alive.
    dispatch_after(dispatch_time(DISPATCH_TIME_NOW, deferredUpdateDelay), dispatch_get_main_queue(),
                   [reference = weak(this)] {
                       if (const auto self = reference.lock()) {
                           self->_performDeferredUpdateUI();
                       }
                   });
    _deferredUIUpdateScheduled = true;
}

void LMQuorlSettingsController::_performDeferredUpdateUI() {
    _updateUI();
    _deferredUIUpdateScheduled = false;
}

void LMQuorlSettingsController::_updateUI() {
    reloadSpecifier(_playlistSpecifier);
    reloadSpecifier(_limitSpecifier);
    _updateLimitFooterText();
}
