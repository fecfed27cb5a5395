#pragma once

#include <array>
#include <filesystem>
#include <functional>

#include "runtime/services/SyncDefaults.h"
#include "services/preferences/SharedPreferences.h"

namespace quorl {

/// The preferences that this app and the sync engine share, copied where the pane reads them all
/// the time: what another process has changed is there when the pane is told. Main thread.
class PreferencesStore final : public SyncPreferencesStore {
  public:
    /// Is told with a sentence for the user why values last no longer than the process, or why one
    /// could not be stored; with an empty one once the opening has gone well.
    using Problem = std::function<void(const std::string& text)>;

    /// Is called on the main thread when another program has chosen other places.
    using PlacesChanged = std::function<void()>;

    /// The same when it has switched notices on or off.
    using NoticesChanged = std::function<void()>;

    /// Who is told of what others change; empty for nobody.
    struct Changes {
        PlacesChanged places;
        NoticesChanged notices;
    };

    /// Opens the preferences.
    PreferencesStore(base::Purpose purpose, Problem problem, Changes changes);

    PreferencesStore(const PreferencesStore&) = delete;
    PreferencesStore& operator=(const PreferencesStore&) = delete;
    ~PreferencesStore() override;

    /// The music folder that was chosen, or else the usual one.
    [[nodiscard]] std::filesystem::path musicFolder() const;

    /// Where the chosen wearable is mounted; empty for the embedded one.
    [[nodiscard]] std::filesystem::path wearableDirectory() const;

    /// Which drive that is on, as it stands in the settings; empty where the path alone counts.
    [[nodiscard]] std::string wearableIdentity() const;

    /// Whether syncs are told of on the desktop.
    [[nodiscard]] bool hasNotices() const;
    void setNotices(bool areOn);

    /// Chooses the music folder.
    void chooseMusicFolder(const std::filesystem::path& folder);

    /// Chooses both for a trial.
    void choosePlaces(const std::filesystem::path& music, const std::filesystem::path& wearable);

    [[nodiscard]] std::optional<std::uint64_t> value(SyncPreference preference) const override;
    [[nodiscard]] bool setValue(SyncPreference preference,
                                std::optional<std::uint64_t> value) override;

    /// Brings the copies up to date before another program's change is announced.
    void takeValues();

  private:
    /// Who is told of a change, this object among them.
    struct Listeners;

    /// What is stored in this moment.
    [[nodiscard]] std::optional<std::uint64_t> stored(SyncPreference preference) const;

    template <class T>
    bool store(const preferences::Preference<T>& preference, const std::type_identity_t<T>& value);

    const Problem problem_;
    const std::shared_ptr<const Listeners> listeners_;
    std::unique_ptr<preferences::SharedPreferences> preferences_; ///< null: nothing can be stored
    std::array<std::optional<std::uint64_t>, syncPreferences.size()> values_;
};

} // namespace quorl
