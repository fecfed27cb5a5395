#pragma once

#include "quorl/app/Notices.h"
#include "runtime/services/SyncDefaults.h"
#include "services/preferences/SharedPreferences.h"

namespace quorl {

/// The preferences that this app and the sync engine share. What goes wrong is a notice; values
/// then last as long as the process. Main thread.
class PreferencesStore final : public SyncPreferencesStore {
  public:
    /// Opens the preferences. `notices` outlives the store.
    explicit PreferencesStore(Notices& notices);

    [[nodiscard]] std::optional<std::uint64_t> value(SyncPreference preference) const override;
    [[nodiscard]] bool setValue(SyncPreference preference,
                                std::optional<std::uint64_t> value) override;

  private:
    Notices& notices_;
    std::unique_ptr<preferences::SharedPreferences> preferences_; ///< null: nothing can be stored
};

} // namespace quorl
