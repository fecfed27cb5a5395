#include "doubles/SyncDefaultsDouble.h"

namespace quorl {

namespace {

std::optional<std::uint64_t> valueOf(const std::shared_ptr<NSNumber>& number) {
    return number ? std::optional(number->unsignedLongLongValue()) : std::nullopt;
}

} // namespace

bool SyncDefaultsDouble::isAssetSyncEnabled() const {
    recorder_->preferenceWillBeRead(SyncPreference::AssetSyncEnabled);
    return SyncDefaults::isAssetSyncEnabled();
}

void SyncDefaultsDouble::setAssetSyncEnabled(bool enabled) {
    recorder_->preferenceWillBeSet(SyncPreference::AssetSyncEnabled, enabled ? 1 : 0);
    SyncDefaults::setAssetSyncEnabled(enabled);
}

std::shared_ptr<NSNumber> SyncDefaultsDouble::assetSyncPlaylistPersistentID() const {
    recorder_->preferenceWillBeRead(SyncPreference::AssetSyncPlaylistPersistentID);
    return SyncDefaults::assetSyncPlaylistPersistentID();
}

void SyncDefaultsDouble::setAssetSyncPlaylistPersistentID(std::shared_ptr<NSNumber> persistentID) {
    recorder_->preferenceWillBeSet(SyncPreference::AssetSyncPlaylistPersistentID,
                                   valueOf(persistentID));
    SyncDefaults::setAssetSyncPlaylistPersistentID(std::move(persistentID));
}

NSUInteger SyncDefaultsDouble::assetSyncLimitType() const {
    recorder_->preferenceWillBeRead(SyncPreference::AssetSyncLimitType);
    return SyncDefaults::assetSyncLimitType();
}

void SyncDefaultsDouble::setAssetSyncLimitType(NSUInteger type) {
    recorder_->preferenceWillBeSet(SyncPreference::AssetSyncLimitType, type);
    SyncDefaults::setAssetSyncLimitType(type);
}

std::shared_ptr<NSNumber> SyncDefaultsDouble::assetSyncLimit() const {
    recorder_->preferenceWillBeRead(SyncPreference::AssetSyncLimit);
    return SyncDefaults::assetSyncLimit();
}

void SyncDefaultsDouble::setAssetSyncLimit(std::shared_ptr<NSNumber> limit) {
    recorder_->preferenceWillBeSet(SyncPreference::AssetSyncLimit, valueOf(limit));
    SyncDefaults::setAssetSyncLimit(std::move(limit));
}

std::shared_ptr<NSNumber> SyncDefaultsDouble::lastFullySentAssetSyncPlaylistPersistentID() const {
    recorder_->preferenceWillBeRead(SyncPreference::LastFullySentAssetSyncPlaylistPersistentID);
    return SyncDefaults::lastFullySentAssetSyncPlaylistPersistentID();
}

std::shared_ptr<NSNumber> SyncDefaultsDouble::lastFullySentAssetSyncPlaylistVersion() const {
    recorder_->preferenceWillBeRead(SyncPreference::LastFullySentAssetSyncPlaylistVersion);
    return SyncDefaults::lastFullySentAssetSyncPlaylistVersion();
}

} // namespace quorl
