#pragma once

#include <functional>

#include "runtime/services/SyncDefaults.h"
#include "services/preferences/SharedPreferences.h"

namespace quorl {

/// The preferences that this app and the sync engine share. Main thread.
class PreferencesStore final : public SyncPreferencesStore {
  public:
    /// Is told with a sentence for the user why values last no longer than the process, or why one
    /// could not be stored; with an empty one once the opening has gone well.
    using Problem = std::function<void(const std::string& text)>;

    /// Opens the preferences.
    explicit PreferencesStore(Problem problem);

    [[nodiscard]] std::optional<std::uint64_t> value(SyncPreference preference) const override;
    [[nodiscard]] bool setValue(SyncPreference preference,
                                std::optional<std::uint64_t> value) override;

  private:
    const Problem problem_;
    std::unique_ptr<preferences::SharedPreferences> preferences_; ///< null: nothing can be stored
};

} // namespace quorl
