#pragma once

#include "runtime/services/SyncDefaults.h"

namespace quorl {

/// The shared preferences in memory, all of them unset at first. Main thread.
class PreferencesDouble final : public SyncPreferencesStore {
  public:
    PreferencesDouble();

    /// From now on every write fails.
    void refuseWrites() { refusesWrites_ = true; }

    [[nodiscard]] std::optional<std::uint64_t> value(SyncPreference preference) const override;
    [[nodiscard]] bool setValue(SyncPreference preference,
                                std::optional<std::uint64_t> value) override;

  private:
    std::array<std::optional<std::uint64_t>, syncPreferences.size()> values_;
    bool refusesWrites_ = false;
};

} // namespace quorl
