// The footer below "Playlist Limit": how many songs fit, what they take and what is left.

#include <algorithm>
#include <array>
#include <cmath>
#include <limits>

#include "platform/MediaLibrary.h"
#include "platform/SizeFormatter.h"
#include "platform/SyncPreferences.h"
#include "settings/LMQuorlSettingsController.h"
#include "settings/LMSyncLimitType.h"
#include "settings/LocalizedText.h"
#include "sync/LMQuorlSyncManager.h"
#include "sync/LMSyncDefaults+Extras.h"

namespace {

constexpr double usageLifetime = 480.0; // seconds

/// What a placeholder of a sentence stands for.
enum class Argument { Percent, Songs, Size, Remaining };

struct Sentence {
    LMQuorlSyncStage stage;
    std::optional<bool> isOneSong; ///< null for any number
    bool isSpaceUnknown;
    LocalizedText text;
    std::array<std::optional<Argument>, 4> arguments;
};

constexpr LocalizedText noPlaylistText{
    "SYNC_SETTINGS_FOOTER_NO_PLAYLIST",
    "No songs synced to Velora. Pick a playlist to sync songs for local playback."};

constexpr auto percent = Argument::Percent;
constexpr auto songs = Argument::Songs;
constexpr auto size = Argument::Size;
constexpr auto remaining = Argument::Remaining;

constexpr std::array sentences{
    Sentence{LMQuorlSyncStageIdle,
             true,
             true,
             {"SYNC_SETTINGS_FOOTER_SYNCED_1_SONG_UNKNOWN_SPACE_REMAINING",
              "1 song synced to Velora, taking up %@."},
             {size}},
    Sentence{LMQuorlSyncStageIdle,
             true,
             false,
             {"SYNC_SETTINGS_FOOTER_SYNCED_1_SONG",
              "1 song synced to Velora, taking up %@ with %@ remaining."},
             {size, remaining}},
    Sentence{LMQuorlSyncStageIdle,
             false,
             true,
             {"SYNC_SETTINGS_FOOTER_SYNCED_N_SONGS_UNKNOWN_SPACE_REMAINING",
              "%tu songs synced to Velora, taking up %@."},
             {songs, size}},
    Sentence{LMQuorlSyncStageIdle,
             false,
             false,
             {"SYNC_SETTINGS_FOOTER_SYNCED_MB_N_SONGS",
              "%tu songs synced to Velora, taking up %@ with %@ remaining."},
             {songs, size, remaining}},
    Sentence{LMQuorlSyncStagePending,
             true,
             true,
             {"SYNC_SETTINGS_FOOTER_SYNC_PENDING_1_SONG_UNKNOWN_SPACE_REMAINING",
              "Will sync 1 song to Velora, which will take up %@"},
             {size}},
    Sentence{LMQuorlSyncStagePending,
             true,
             false,
             {"SYNC_SETTINGS_FOOTER_SYNC_PENDING_1_SONG",
              "Will sync 1 song to Velora, which will take up %@ with %@ remaining."},
             {size, remaining}},
    Sentence{LMQuorlSyncStagePending,
             false,
             true,
             {"SYNC_SETTINGS_FOOTER_SYNC_PENDING_N_SONGS_UNKNOWN_SPACE_REMAINING",
              "Will sync %tu songs to Velora, which will take up %@."},
             {songs, size}},
    Sentence{LMQuorlSyncStagePending,
             false,
             false,
             {"SYNC_SETTINGS_FOOTER_SYNC_PENDING_N_SONGS",
              "Will sync %tu songs to Velora, which will take up %@ with %@ remaining."},
             {songs, size, remaining}},
    Sentence{LMQuorlSyncStageIndeterminateSyncing,
             std::nullopt,
             true,
             {"SYNC_SETTINGS_FOOTER_INDETERMINATE_SYNC_UNKNOWN_SPACE_REMAINING",
              "Syncing music to Velora, which will take up %@."},
             {size}},
    Sentence{LMQuorlSyncStageIndeterminateSyncing,
             std::nullopt,
             false,
             {"SYNC_SETTINGS_FOOTER_INDETERMINATE_SYNC",
              "Syncing music to Velora, which will take up %@ with %@ remaining."},
             {size, remaining}},
    Sentence{LMQuorlSyncStageSyncing,
             true,
             true,
             {"SYNC_SETTINGS_FOOTER_SYNCING_1_SONG_UNKNOWN_SPACE_REMAINING",
              "Currently %tu%% through syncing 1 song to Velora, which will take up %@."},
             {percent, size}},
    Sentence{LMQuorlSyncStageSyncing,
             true,
             false,
             {"SYNC_SETTINGS_FOOTER_SYNCING_1_SONG",
              "Currently %tu%% through syncing 1 song to Velora, which will take up %@ with %@ "
              "remaining."},
             {percent, size, remaining}},
    Sentence{LMQuorlSyncStageSyncing,
             false,
             true,
             {"SYNC_SETTINGS_FOOTER_SYNCING_N_SONGS_UNKNOWN_SPACE_REMAINING",
              "Currently %tu%% through syncing %tu songs to Velora, which will take up %@."},
             {percent, songs, size}},
    Sentence{LMQuorlSyncStageSyncing,
             false,
             false,
             {"SYNC_SETTINGS_FOOTER_SYNCING_N_SONGS",
              "Currently %tu%% through syncing %tu songs to Velora, which will take up %@ with %@ "
              "remaining."},
             {percent, songs, size, remaining}},
};

/// Null for a stage that has no sentence.
const Sentence* sentenceFor(NSInteger stage, NSUInteger songCount, bool isSpaceUnknown) {
    const auto* found =
        std::find_if(sentences.begin(), sentences.end(), [=](const Sentence& sentence) {
            return sentence.stage == stage && sentence.isSpaceUnknown == isSpaceUnknown &&
                   sentence.isOneSong.value_or(songCount == 1) == (songCount == 1);
        });
    return found == sentences.end() ? nullptr : found;
}

struct Limits {
    std::uint64_t bytes = std::numeric_limits<std::uint64_t>::max();
    NSUInteger songs = std::numeric_limits<NSUInteger>::max();
};

Limits limitsOf(NSUInteger type, NSUInteger amount) {
    Limits limits;
    if (type == LMSyncLimitTypeStorage) {
        limits.bytes = std::uint64_t{amount} << LMSyncLimitMegabyteShift;
    } else if (type == LMSyncLimitTypeSongs) {
        limits.songs = amount;
    }
    return limits;
}

struct Selection {
    NSUInteger songs = 0;
    std::uint64_t bytes = 0;
};

std::uint64_t fileSize(const MPMediaItem& item) {
    const auto value = item.valueForProperty(MPMediaItemPropertyFileSize);
    const auto* number = dynamic_cast<const NSNumber*>(value.get());
    return number ? number->unsignedLongLongValue() : 0;
}

/// The songs from the top of the playlist to the first one that does not fit; later ones are not
/// tried.
Selection songsWithin(const Limits& limits, const std::shared_ptr<MPMediaPlaylist>& playlist) {
    Selection selection;
    const auto items = playlist ? playlist->items() : nullptr;
    for (const auto& item : elements(items)) {
        const std::uint64_t bytes = selection.bytes + fileSize(*item);
        if (bytes > limits.bytes || selection.songs == limits.songs) {
            break;
        }
        selection.bytes = bytes;
        ++selection.songs;
    }
    return selection;
}

NSUInteger syncedPercent() {
    const float progress = LMQuorlSyncManager::sharedManager()->progress();
    return NSSaturatingTruncate<NSUInteger>(static_cast<double>(progress) * 100.0);
}

double figure(const std::map<std::string, std::shared_ptr<NSNumber>, std::less<>>& usage,
              std::string_view key) {
    const auto found = usage.find(key);
    return found == usage.end() || !found->second ? 0.0 : found->second->doubleValue();
}

} // namespace

void LMQuorlSettingsController::_updateLimitFooterText() {
    if (_limitGroupSpecifier) {
        _limitGroupSpecifier->setProperty_forKey(std::nullopt, PSFooterTextGroupKey);
    }
    if (!_lssManager) {
        _lssManager = create<LSSManager>(&LSSManager::initWithQueue, dispatch_get_main_queue());
    }
    _updateLimitFooterTextWithAvailableDeviceBytes();
    if (_isAvailableDeviceBytesOutOfDate()) {
        // The handler keeps this pane alive until the reply has come.
        _lssManager->getUsage([self = strong(this)](const NSDictionary<NSNumber>& usage,
                                                    const std::shared_ptr<NSError>& /*error*/) {
            self->_usageDidArrive(usage);
        });
    }
}

void LMQuorlSettingsController::_usageDidArrive(const NSDictionary<NSNumber>& usage) {
    if (!usage) {
        return;
    }
    const double available = figure(*usage, kLSSUsageAvailableStorageKey);
    const double taken = figure(*usage, kLSSUsageSongsKey);
    _deviceBytesRemainingRetrievedDate = NSDate::date();
    const double sum = available + taken;
    _deviceBytesRemaining = NSNumber::numberWithDouble(sum < 0.0 ? 0.0 : sum);
    _updateLimitFooterTextWithAvailableDeviceBytes();
}

bool LMQuorlSettingsController::_isAvailableDeviceBytesOutOfDate() const {
    if (!_deviceBytesRemainingRetrievedDate) {
        return true;
    }
    const double age = NSDate::date()->timeIntervalSinceDate(*_deviceBytesRemainingRetrievedDate);
    return std::abs(age) > usageLifetime; // a clock that was set back makes the figure stale too
}

void LMQuorlSettingsController::_updateLimitFooterTextWithAvailableDeviceBytes() {
    LMSyncDefaults& defaults = LMSyncDefaults::sharedDefaults();
    const NSUInteger type = defaults.assetSyncLimitType();
    const auto limit = defaults.assetSyncLimit();
    const Limits limits = limitsOf(type, limit ? limit->unsignedIntegerValue() : 0);
    const Selection selection = songsWithin(limits, assetSyncPlaylist(defaults));
    const std::uint64_t bytes = std::min(selection.bytes, limits.bytes);

    const LMQuorlSyncStage stage = LMQuorlSyncManager::sharedManager()->syncStage();
    LMSyncDefaults& current = LMSyncDefaults::sharedDefaults();
    const bool isSyncing = current.isAssetSyncEnabled() && assetSyncPlaylist(current) != nullptr;
    const auto text = isSyncing ? _limitFooterSentence(stage, selection.songs, bytes)
                                : std::optional(localized(*this, noPlaylistText));
    if (_limitGroupSpecifier) {
        _limitGroupSpecifier->setProperty_forKey(text, PSFooterTextGroupKey);
    }
    reload();
}

std::optional<std::string>
LMQuorlSettingsController::_limitFooterSentence(NSInteger stage, NSUInteger songCount,
                                                std::uint64_t bytes) const {
    const std::string sizeText = CPFSSizeStrings(static_cast<float>(bytes));
    const bool isSpaceUnknown = _isAvailableDeviceBytesOutOfDate();
    std::string remainingText = "?";
    // Asked again on purpose: the figure may have turned stale since the line above.
    if (!_isAvailableDeviceBytesOutOfDate()) {
        remainingText =
            CPFSSizeStrings(static_cast<float>(_deviceBytesRemaining->unsignedLongLongValue()));
    }
    const Sentence* sentence = sentenceFor(stage, songCount, isSpaceUnknown);
    if (!sentence) {
        return std::nullopt;
    }
    std::vector<NSFormatArgument> arguments;
    for (const auto& argument : sentence->arguments) {
        if (argument == Argument::Percent) {
            arguments.emplace_back(syncedPercent());
        } else if (argument == Argument::Songs) {
            arguments.emplace_back(songCount);
        } else if (argument == Argument::Size) {
            arguments.emplace_back(sizeText);
        } else if (argument == Argument::Remaining) {
            arguments.emplace_back(remainingText);
        }
    }
    return NSString::localizedStringWithFormat(localized(*this, sentence->text), arguments);
}
