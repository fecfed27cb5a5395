// The footer below "Playlist Limit": how many songs fit, what they take and what is left.

#include <algorithm>
#include <array>
#include <cmath>
#include <limits>

#include "platform/LocalizedText.h"
#include "platform/MediaLibrary.h"
#include "platform/SizeFormatter.h"
#include "platform/SyncPreferences.h"
#include "settings/LMQuorlSettingsController.h"
#include "settings/LMSyncLimitType.h"
#include "sync/LMQuorlSyncManager.h"
#include "sync/LMSyncDefaults+Extras.h"

namespace {

constexpr double usageLifetime = 480.0; // seconds

/// How many songs a sentence speaks of, "many" being any number but one, and whether it says what
/// is left on the wearable.
enum class Songs { One, Many, Any };
enum class Space { Known, Unknown };

/// When a sentence is the one to say.
struct Occasion {
    LMQuorlSyncStage stage;
    Songs songs;
    Space space;
};

struct Sentence {
    Occasion occasion;
    LocalizedText text;
};

constexpr LocalizedText noPlaylistText{
    "SYNC_SETTINGS_FOOTER_NO_PLAYLIST",
    "No songs synced to Velora. Pick a playlist to sync songs for local playback."};

// What a sentence has placeholders for follows from its occasion: the percentage while syncing, the
// number of songs where they are many, always their size, and what is left where that is known.
constexpr std::array sentences{
    Sentence{{LMQuorlSyncStageIdle, Songs::One, Space::Unknown},
             {"SYNC_SETTINGS_FOOTER_SYNCED_1_SONG_UNKNOWN_SPACE_REMAINING",
              "1 song synced to Velora, taking up %@."}},
    Sentence{{LMQuorlSyncStageIdle, Songs::One, Space::Known},
             {"SYNC_SETTINGS_FOOTER_SYNCED_1_SONG",
              "1 song synced to Velora, taking up %@ with %@ remaining."}},
    Sentence{{LMQuorlSyncStageIdle, Songs::Many, Space::Unknown},
             {"SYNC_SETTINGS_FOOTER_SYNCED_N_SONGS_UNKNOWN_SPACE_REMAINING",
              "%tu songs synced to Velora, taking up %@."}},
    Sentence{{LMQuorlSyncStageIdle, Songs::Many, Space::Known},
             {"SYNC_SETTINGS_FOOTER_SYNCED_MB_N_SONGS",
              "%tu songs synced to Velora, taking up %@ with %@ remaining."}},
    Sentence{{LMQuorlSyncStagePending, Songs::One, Space::Unknown},
             {"SYNC_SETTINGS_FOOTER_SYNC_PENDING_1_SONG_UNKNOWN_SPACE_REMAINING",
              "Will sync 1 song to Velora, which will take up %@"}},
    Sentence{{LMQuorlSyncStagePending, Songs::One, Space::Known},
             {"SYNC_SETTINGS_FOOTER_SYNC_PENDING_1_SONG",
              "Will sync 1 song to Velora, which will take up %@ with %@ remaining."}},
    Sentence{{LMQuorlSyncStagePending, Songs::Many, Space::Unknown},
             {"SYNC_SETTINGS_FOOTER_SYNC_PENDING_N_SONGS_UNKNOWN_SPACE_REMAINING",
              "Will sync %tu songs to Velora, which will take up %@."}},
    Sentence{{LMQuorlSyncStagePending, Songs::Many, Space::Known},
             {"SYNC_SETTINGS_FOOTER_SYNC_PENDING_N_SONGS",
              "Will sync %tu songs to Velora, which will take up %@ with %@ remaining."}},
    Sentence{{LMQuorlSyncStageIndeterminateSyncing, Songs::Any, Space::Unknown},
             {"SYNC_SETTINGS_FOOTER_INDETERMINATE_SYNC_UNKNOWN_SPACE_REMAINING",
              "Syncing music to Velora, which will take up %@."}},
    Sentence{{LMQuorlSyncStageIndeterminateSyncing, Songs::Any, Space::Known},
             {"SYNC_SETTINGS_FOOTER_INDETERMINATE_SYNC",
              "Syncing music to Velora, which will take up %@ with %@ remaining."}},
    Sentence{{LMQuorlSyncStageSyncing, Songs::One, Space::Unknown},
             {"SYNC_SETTINGS_FOOTER_SYNCING_1_SONG_UNKNOWN_SPACE_REMAINING",
              "Currently %tu%% through syncing 1 song to Velora, which will take up %@."}},
    Sentence{{LMQuorlSyncStageSyncing, Songs::One, Space::Known},
             {"SYNC_SETTINGS_FOOTER_SYNCING_1_SONG",
              "Currently %tu%% through syncing 1 song to Velora, which will take up %@ with %@ "
              "remaining."}},
    Sentence{{LMQuorlSyncStageSyncing, Songs::Many, Space::Unknown},
             {"SYNC_SETTINGS_FOOTER_SYNCING_N_SONGS_UNKNOWN_SPACE_REMAINING",
              "Currently %tu%% through syncing %tu songs to Velora, which will take up %@."}},
    Sentence{{LMQuorlSyncStageSyncing, Songs::Many, Space::Known},
             {"SYNC_SETTINGS_FOOTER_SYNCING_N_SONGS",
              "Currently %tu%% through syncing %tu songs to Velora, which will take up %@ with %@ "
              "remaining."}},
};

/// Null for a stage that has no sentence.
const Sentence* sentenceFor(NSInteger stage, NSUInteger songCount, Space space) {
    const Songs songs = songCount == 1 ? Songs::One : Songs::Many;
    const auto* found =
        std::find_if(sentences.begin(), sentences.end(), [=](const Sentence& sentence) {
            const auto& [itsStage, itsSongs, itsSpace] = sentence.occasion;
            return itsStage == stage && itsSpace == space &&
                   (itsSongs == songs || itsSongs == Songs::Any);
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

/// What of a playlist fits within the limits.
struct Fit {
    NSUInteger songs = 0;
    std::uint64_t bytes = 0;
};

std::uint64_t fileSize(const MPMediaItem& item) {
    const auto value = item.valueForProperty(MPMediaItemPropertyFileSize);
    const auto* number = NSNumber::of(value.get());
    return number ? number->unsignedLongLongValue() : 0;
}

/// The songs from the top of the playlist to the first one that does not fit; later ones are not
/// tried.
Fit songsWithin(const Limits& limits, const std::shared_ptr<MPMediaPlaylist>& playlist) {
    Fit fit;
    const auto items = playlist ? playlist->items() : nullptr;
    for (const auto& item : elements(items)) {
        const std::uint64_t bytes = fit.bytes + fileSize(*item);
        if (bytes > limits.bytes || fit.songs == limits.songs) {
            break;
        }
        fit.bytes = bytes;
        ++fit.songs;
    }
    return fit;
}

NSUInteger syncedPercent() {
    const float progress = LMQuorlSyncManager::sharedManager()->progress();
    return NSSaturatingTruncate<NSUInteger>(static_cast<double>(progress) * 100.0);
}

/// In the order of the placeholders. The progress is asked for only where it is spoken of.
std::vector<NSFormatArgument> argumentsFor(const Occasion& occasion, NSUInteger songCount,
                                           const std::string& size, const std::string& remaining) {
    std::vector<NSFormatArgument> arguments;
    if (occasion.stage == LMQuorlSyncStageSyncing) {
        arguments.emplace_back(syncedPercent());
    }
    if (occasion.songs == Songs::Many) {
        arguments.emplace_back(songCount);
    }
    arguments.emplace_back(size);
    if (occasion.space == Space::Known) {
        arguments.emplace_back(remaining);
    }
    return arguments;
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
    const Fit fit = songsWithin(limits, assetSyncPlaylist(defaults));
    // Whatever the items say of their sizes, the pane shows no more than the user allowed.
    const std::uint64_t bytes = std::min(fit.bytes, limits.bytes);

    const LMQuorlSyncStage stage = LMQuorlSyncManager::sharedManager()->syncStage();
    // Asked once more, after the stage: another process may have switched sync off or made another
    // choice meanwhile, and the sentence is about what is chosen now.
    LMSyncDefaults& current = LMSyncDefaults::sharedDefaults();
    const bool isOnAndChosen =
        current.isAssetSyncEnabled() && assetSyncPlaylist(current) != nullptr;
    const auto text = isOnAndChosen ? _limitFooterSentence(stage, fit.songs, bytes)
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
    const Space space = _isAvailableDeviceBytesOutOfDate() ? Space::Unknown : Space::Known;
    std::string remainingText = "?";
    // Asked again on purpose: the figure may have turned stale since the line above.
    if (!_isAvailableDeviceBytesOutOfDate()) {
        remainingText =
            CPFSSizeStrings(static_cast<float>(_deviceBytesRemaining->unsignedLongLongValue()));
    }
    const Sentence* sentence = sentenceFor(stage, songCount, space);
    if (!sentence) {
        return std::nullopt;
    }
    const auto arguments = argumentsFor(sentence->occasion, songCount, sizeText, remainingText);
    return NSString::localizedStringWithFormat(localized(*this, sentence->text), arguments);
}
