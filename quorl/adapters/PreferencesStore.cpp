#include "quorl/adapters/PreferencesStore.h"

#include <optional>

#include "platform/Dispatch.h"
#include "services/preferences/ChosenPlaces.h"

namespace quorl {

using namespace preferences;

struct PreferencesStore::Listeners : Changes {
    std::function<void()> values;
};

namespace {

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
T storable(const Preference<T>& /*preference*/, std::optional<std::uint64_t> value) {
    if constexpr (std::is_same_v<T, bool>) {
        return value.value_or(0) != 0;
    } else if constexpr (std::is_same_v<T, std::uint64_t>) {
        return value.value_or(0);
    } else {
        return value;
    }
}

/// Has the main thread tell one of the listeners, as long as there are any. Any thread.
template <class Listeners, class Class>
void tell(const std::weak_ptr<const Listeners>& listeners, std::function<void()> Class::*change) {
    dispatch_async(dispatch_get_main_queue(), [listeners, change] {
        const auto told = listeners.lock();
        if (told && (*told).*change) {
            ((*told).*change)();
        }
    });
}

/// What another program has changed. Any thread.
template <class Listeners>
void announce(const KeySet& keys, const std::weak_ptr<const Listeners>& listeners) {
    const auto places = keys.count(musicFolder.key) + keys.count(wearableDirectory.key) +
                        keys.count(wearableIdentity.key);
    const auto notices = keys.count(desktopNotices.key);
    if (places + notices < keys.size()) {
        tell(listeners, &Listeners::values);
        SyncDefaults::announceChange();
    }
    if (places > 0) {
        tell(listeners, &Listeners::places);
    }
    if (notices > 0) {
        tell(listeners, &Listeners::notices);
    }
}

} // namespace

PreferencesStore::PreferencesStore(base::Purpose purpose, Problem problem, Changes changes)
    : problem_(std::move(problem)),
      listeners_(std::make_shared<const Listeners>(
          Listeners{std::move(changes), [this] { takeValues(); }})) {
    auto opened = SharedPreferences::open(
        [reference = std::weak_ptr(listeners_)](const SharedPreferences& /*preferences*/,
                                                const KeySet& keys) { announce(keys, reference); },
        purpose);
    preferences_ = std::move(opened.preferences);
    takeValues();
    problem_(opened.problem);
}

PreferencesStore::~PreferencesStore() = default;

std::filesystem::path PreferencesStore::musicFolder() const {
    return preferences_ ? chosenMusicFolder(*preferences_) : usualMusicFolder();
}

std::filesystem::path PreferencesStore::wearableDirectory() const {
    return preferences_ ? chosenWearable(*preferences_) : std::filesystem::path();
}

std::string PreferencesStore::wearableIdentity() const {
    return preferences_ ? preferences_->get(preferences::wearableIdentity) : std::string();
}

bool PreferencesStore::hasNotices() const {
    return preferences_ ? preferences_->get(desktopNotices) : desktopNotices.defaultValue;
}

void PreferencesStore::setNotices(bool areOn) {
    if (preferences_) {
        store(desktopNotices, areOn);
    }
}

void PreferencesStore::chooseMusicFolder(const std::filesystem::path& folder) {
    if (preferences_) {
        store(preferences::musicFolder, folder.string());
    }
}

void PreferencesStore::choosePlaces(const std::filesystem::path& music,
                                    const std::filesystem::path& wearable) {
    chooseMusicFolder(music);
    if (preferences_) {
        store(preferences::wearableIdentity, std::string());
        store(preferences::wearableDirectory, wearable.string());
    }
}

std::optional<std::uint64_t> PreferencesStore::value(SyncPreference preference) const {
    return values_[placeOf(preference)];
}

bool PreferencesStore::setValue(SyncPreference preference, std::optional<std::uint64_t> value) {
    if (!preferences_) {
        return false; // it was told at the opening
    }
    const bool changed = with(
        preference, [this, value](const auto& key) { return store(key, storable(key, value)); });
    values_[placeOf(preference)] = stored(preference);
    return changed;
}

std::optional<std::uint64_t> PreferencesStore::stored(SyncPreference preference) const {
    return with(preference, [this](const auto& key) {
        return std::optional<std::uint64_t>(preferences_ ? preferences_->get(key)
                                                         : key.defaultValue);
    });
}

void PreferencesStore::takeValues() {
    for (const auto& declaration : syncPreferences) {
        values_[placeOf(declaration.preference)] = stored(declaration.preference);
    }
}

template <class T>
bool PreferencesStore::store(const Preference<T>& preference,
                             const std::type_identity_t<T>& value) {
    const auto result = preferences_->set(preference, value);
    if (!result.problem.empty()) {
        problem_(result.problem);
    }
    return result.changed;
}

} // namespace quorl
