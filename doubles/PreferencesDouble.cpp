#include "doubles/PreferencesDouble.h"

namespace quorl {

namespace {

std::optional<std::uint64_t> unsetValue(SyncPreference preference) {
    const auto& declaration = syncPreferences.at(static_cast<std::size_t>(preference));
    return declaration.canBeNull() ? std::nullopt : std::optional<std::uint64_t>(0);
}

} // namespace

std::optional<std::uint64_t> PreferencesDouble::value(SyncPreference preference) const {
    const auto found = values_.find(preference);
    return found == values_.end() ? unsetValue(preference) : found->second;
}

bool PreferencesDouble::setValue(SyncPreference preference, std::optional<std::uint64_t> value) {
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

} // namespace quorl
