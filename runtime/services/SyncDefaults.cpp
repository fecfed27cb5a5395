#include "runtime/services/SyncDefaults.h"

#include "platform/Dispatch.h"

namespace quorl {

namespace {

std::optional<std::uint64_t> valueOf(const std::shared_ptr<NSNumber>& number) {
    return number ? std::optional(number->unsignedLongLongValue()) : std::nullopt;
}

} // namespace

bool SyncDefaults::isAssetSyncEnabled() const {
    return store_.value(SyncPreference::AssetSyncEnabled).value_or(0) != 0;
}

void SyncDefaults::setAssetSyncEnabled(bool enabled) {
    set(SyncPreference::AssetSyncEnabled, enabled ? 1 : 0);
}

std::shared_ptr<NSNumber> SyncDefaults::assetSyncPlaylistPersistentID() const {
    return number(SyncPreference::AssetSyncPlaylistPersistentID);
}

void SyncDefaults::setAssetSyncPlaylistPersistentID(std::shared_ptr<NSNumber> persistentID) {
    set(SyncPreference::AssetSyncPlaylistPersistentID, valueOf(persistentID));
}

NSUInteger SyncDefaults::assetSyncLimitType() const {
    return static_cast<NSUInteger>(store_.value(SyncPreference::AssetSyncLimitType).value_or(0));
}

void SyncDefaults::setAssetSyncLimitType(NSUInteger type) {
    set(SyncPreference::AssetSyncLimitType, type);
}

std::shared_ptr<NSNumber> SyncDefaults::assetSyncLimit() const {
    return number(SyncPreference::AssetSyncLimit);
}

void SyncDefaults::setAssetSyncLimit(std::shared_ptr<NSNumber> limit) {
    set(SyncPreference::AssetSyncLimit, valueOf(limit));
}

std::shared_ptr<NSNumber> SyncDefaults::lastFullySentAssetSyncPlaylistPersistentID() const {
    return number(SyncPreference::LastFullySentAssetSyncPlaylistPersistentID);
}

std::shared_ptr<NSNumber> SyncDefaults::lastFullySentAssetSyncPlaylistVersion() const {
    return number(SyncPreference::LastFullySentAssetSyncPlaylistVersion);
}

void SyncDefaults::announceChange() {
    dispatch_async(dispatch_get_main_queue(), [] {
        NSNotificationCenter::defaultCenter().postNotificationName_object(
            LMSyncPreferencesDidChangeNotification, nullptr);
    });
}

std::shared_ptr<NSNumber> SyncDefaults::number(SyncPreference preference) const {
    const auto value = store_.value(preference);
    if (!value) {
        return nullptr;
    }
    auto& number = numbers_[placeOf(preference)];
    if (!number || number->unsignedLongLongValue() != *value) {
        number = NSNumber::numberWithUnsignedLongLong(*value);
    }
    return number;
}

void SyncDefaults::set(SyncPreference preference, std::optional<std::uint64_t> value) {
    if (store_.setValue(preference, value)) {
        announceChange();
    }
}

} // namespace quorl
