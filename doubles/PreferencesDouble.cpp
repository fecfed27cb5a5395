#include "doubles/PreferencesDouble.h"

namespace quorl {

namespace {

std::optional<std::uint64_t> unsetValue(SyncPreference preference) {
    const auto& declaration = syncPreferences.at(placeOf(preference));
    return declaration.canBeNull() ? std::nullopt : std::optional<std::uint64_t>(0);
}

} // namespace

PreferencesDouble::PreferencesDouble() {
    for (const auto& declaration : syncPreferences) {
        values_.at(placeOf(declaration.preference)) = unsetValue(declaration.preference);
    }
}

std::optional<std::uint64_t> PreferencesDouble::value(SyncPreference preference) const {
    return values_.at(placeOf(preference));
}

bool PreferencesDouble::setValue(SyncPreference preference, std::optional<std::uint64_t> value) {
    const auto stored = value ? value : unsetValue(preference);
    auto& kept = values_.at(placeOf(preference));
    if (refusesWrites_ || kept == stored) {
        return false;
    }
    kept = stored;
    return true;
}

} // namespace quorl
