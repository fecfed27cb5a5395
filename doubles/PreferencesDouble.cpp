#include "doubles/PreferencesDouble.h"

namespace quorl {

namespace {

std::optional<std::uint64_t> unsetValue(SyncPreference preference) {
    const auto& declaration = syncPreferences.at(static_cast<std::size_t>(preference));
    return declaration.canBeNull() ? std::nullopt : std::optional<std::uint64_t>(0);
}

Json idOf(const std::shared_ptr<NSNumber>& id) {
    return id ? Json(std::to_string(id->unsignedLongLongValue())) : Json(nullptr);
}

Json amountOf(const std::shared_ptr<NSNumber>& amount) {
    return amount ? Json(amount->unsignedLongLongValue()) : Json(nullptr);
}

} // namespace

std::optional<std::uint64_t> ScriptedPreferences::value(SyncPreference preference) const {
    const auto found = values_.find(preference);
    return found == values_.end() ? unsetValue(preference) : found->second;
}

bool ScriptedPreferences::setValue(SyncPreference preference, std::optional<std::uint64_t> value) {
    if (value) {
        values_[preference] = *value;
    } else {
        values_.erase(preference);
    }
    return true;
}

void TracingSyncDefaults::setAssetSyncEnabled(bool enabled) {
    trace_->record("LMSyncDefaults", "setAssetSyncEnabled:", enabled);
    SyncDefaults::setAssetSyncEnabled(enabled);
}

void TracingSyncDefaults::setAssetSyncPlaylistPersistentID(std::shared_ptr<NSNumber> persistentID) {
    trace_->record("LMSyncDefaults", "setAssetSyncPlaylistPersistentID:", idOf(persistentID));
    SyncDefaults::setAssetSyncPlaylistPersistentID(std::move(persistentID));
}

void TracingSyncDefaults::setAssetSyncLimitType(NSUInteger type) {
    trace_->record("LMSyncDefaults", "setAssetSyncLimitType:", type);
    SyncDefaults::setAssetSyncLimitType(type);
}

void TracingSyncDefaults::setAssetSyncLimit(std::shared_ptr<NSNumber> limit) {
    trace_->record("LMSyncDefaults", "setAssetSyncLimit:", amountOf(limit));
    SyncDefaults::setAssetSyncLimit(std::move(limit));
}

} // namespace quorl
