#pragma once

#include "quorl-script/Trace.h"
#include "runtime/services/SyncDefaults.h"

namespace quorl {

/// The preferences of a script, all of them unset at first. Main thread.
class ScriptedPreferences final : public SyncPreferencesStore {
  public:
    [[nodiscard]] std::optional<std::uint64_t> value(SyncPreference preference) const override;
    [[nodiscard]] bool setValue(SyncPreference preference,
                                std::optional<std::uint64_t> value) override;

  private:
    std::map<SyncPreference, std::uint64_t> values_;
};

/// The preferences as the plug-in sees them, with a trace of what it writes.
class TracingSyncDefaults final : public SyncDefaults {
  public:
    /// `store` outlives this object.
    TracingSyncDefaults(SyncPreferencesStore& store, std::shared_ptr<Trace> trace)
        : SyncDefaults(store), trace_(std::move(trace)) {}

    void setAssetSyncEnabled(bool enabled) override;
    void setAssetSyncPlaylistPersistentID(std::shared_ptr<NSNumber> persistentID) override;
    void setAssetSyncLimitType(NSUInteger type) override;
    void setAssetSyncLimit(std::shared_ptr<NSNumber> limit) override;

  private:
    std::shared_ptr<Trace> trace_;
};

} // namespace quorl
