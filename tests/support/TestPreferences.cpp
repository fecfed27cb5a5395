#include "tests/support/TestPreferences.h"

namespace quorl::tests {

namespace {

std::string textOf(const std::shared_ptr<NSNumber>& number) {
    return number ? std::to_string(number->unsignedLongLongValue()) : "null";
}

} // namespace

void TestPreferencesStore::changeElsewhere(SyncPreference preference,
                                           std::optional<std::uint64_t> value) {
    if (value) {
        values_[preference] = *value;
    } else {
        values_.erase(preference);
    }
    SyncDefaults::announceChange();
}

std::optional<std::uint64_t> TestPreferencesStore::value(SyncPreference preference) const {
    const auto found = values_.find(preference);
    return found == values_.end() ? std::nullopt : std::optional(found->second);
}

bool TestPreferencesStore::setValue(SyncPreference preference, std::optional<std::uint64_t> value) {
    if (refusesWrites_) {
        return false;
    }
    if (value) {
        values_[preference] = *value;
    } else {
        values_.erase(preference);
    }
    return true;
}

bool RecordingDefaults::isAssetSyncEnabled() const {
    journal_.note("read assetSyncEnabled");
    return SyncDefaults::isAssetSyncEnabled();
}

void RecordingDefaults::setAssetSyncEnabled(bool enabled) {
    journal_.note(std::string("write assetSyncEnabled ") + (enabled ? "1" : "0"));
    SyncDefaults::setAssetSyncEnabled(enabled);
}

std::shared_ptr<NSNumber> RecordingDefaults::assetSyncPlaylistPersistentID() const {
    journal_.note("read assetSyncPlaylistPersistentID");
    return SyncDefaults::assetSyncPlaylistPersistentID();
}

void RecordingDefaults::setAssetSyncPlaylistPersistentID(std::shared_ptr<NSNumber> persistentID) {
    journal_.note("write assetSyncPlaylistPersistentID " + textOf(persistentID));
    SyncDefaults::setAssetSyncPlaylistPersistentID(std::move(persistentID));
}

NSUInteger RecordingDefaults::assetSyncLimitType() const {
    journal_.note("read assetSyncLimitType");
    return SyncDefaults::assetSyncLimitType();
}

void RecordingDefaults::setAssetSyncLimitType(NSUInteger type) {
    journal_.note("write assetSyncLimitType " + std::to_string(type));
    SyncDefaults::setAssetSyncLimitType(type);
}

std::shared_ptr<NSNumber> RecordingDefaults::assetSyncLimit() const {
    journal_.note("read assetSyncLimit");
    return SyncDefaults::assetSyncLimit();
}

void RecordingDefaults::setAssetSyncLimit(std::shared_ptr<NSNumber> limit) {
    journal_.note("write assetSyncLimit " + textOf(limit));
    SyncDefaults::setAssetSyncLimit(std::move(limit));
}

std::shared_ptr<NSNumber> RecordingDefaults::lastFullySentAssetSyncPlaylistPersistentID() const {
    journal_.note("read lastFullySentAssetSyncPlaylistPersistentID");
    return SyncDefaults::lastFullySentAssetSyncPlaylistPersistentID();
}

std::shared_ptr<NSNumber> RecordingDefaults::lastFullySentAssetSyncPlaylistVersion() const {
    journal_.note("read lastFullySentAssetSyncPlaylistVersion");
    return SyncDefaults::lastFullySentAssetSyncPlaylistVersion();
}

} // namespace quorl::tests
