#include "quorl/adapters/PreferencesStore.h"

#include <optional>

namespace quorl {

namespace {

using namespace preferences;

/// Calls `use` with the stored preference that stands for `preference`: both are in the order of
/// the schema, which comes before all others.
template <class Use>
auto with(SyncPreference preference, Use use) {
    std::optional<decltype(use(assetSyncEnabled))> result;
    auto place = static_cast<int>(preference);
    forEachPreference([&]<class T>(const Preference<T>& stored) {
        if constexpr (!std::is_same_v<T, std::string>) {
            if (place-- == 0) {
                result.emplace(use(stored));
            }
        }
    });
    return std::move(result).value();
}

/// A preference that always has a value stores 0 in place of null.
template <class T>
T stored(const Preference<T>& /*preference*/, std::optional<std::uint64_t> value) {
    if constexpr (std::is_same_v<T, bool>) {
        return value.value_or(0) != 0;
    } else if constexpr (std::is_same_v<T, std::uint64_t>) {
        return value.value_or(0);
    } else {
        return value;
    }
}

} // namespace

PreferencesStore::PreferencesStore(Problem problem) : problem_(std::move(problem)) {
    auto opened =
        SharedPreferences::open([](SharedPreferences& /*preferences*/, const KeySet& /*keys*/) {
            SyncDefaults::announceChange();
        });
    preferences_ = std::move(opened.preferences);
    problem_(opened.problem);
}

std::optional<std::uint64_t> PreferencesStore::value(SyncPreference preference) const {
    return with(preference, [this](const auto& key) {
        return std::optional<std::uint64_t>(preferences_ ? preferences_->get(key)
                                                         : key.defaultValue);
    });
}

bool PreferencesStore::setValue(SyncPreference preference, std::optional<std::uint64_t> value) {
    if (!preferences_) {
        return false; // it was told at the opening
    }
    const auto result = with(preference, [this, value](const auto& key) {
        return preferences_->set(key, stored(key, value));
    });
    if (!result.problem.empty()) {
        problem_(result.problem);
    }
    return result.problem.empty();
}

} // namespace quorl
