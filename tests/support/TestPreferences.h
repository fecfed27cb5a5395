#pragma once

#include "runtime/services/SyncDefaults.h"
#include "tests/support/Journal.h"

namespace quorl::tests {

/// A store in memory. Sync is off, the limit 0 megabytes and all else null until it is set.
class TestPreferencesStore final : public SyncPreferencesStore {
  public:
    /// What another process does: stores a value and announces the change.
    void changeElsewhere(SyncPreference preference, std::optional<std::uint64_t> value);

    /// From now on every write fails.
    void refuseWrites() { refusesWrites_ = true; }

    [[nodiscard]] std::optional<std::uint64_t> value(SyncPreference preference) const override;
    [[nodiscard]] bool setValue(SyncPreference preference,
                                std::optional<std::uint64_t> value) override;

  private:
    std::map<SyncPreference, std::uint64_t> values_{{SyncPreference::AssetSyncEnabled, 0},
                                                    {SyncPreference::AssetSyncLimitType, 0}};
    bool refusesWrites_ = false;
};

/// The runtime's preferences, with a line in the journal for each call: "read NAME" and
/// "write NAME VALUE".
class RecordingDefaults final : public SyncDefaults {
  public:
    RecordingDefaults(SyncPreferencesStore& store, Journal& journal)
        : SyncDefaults(store), journal_(journal) {}

    [[nodiscard]] bool isAssetSyncEnabled() const override;
    void setAssetSyncEnabled(bool enabled) override;
    [[nodiscard]] std::shared_ptr<NSNumber> assetSyncPlaylistPersistentID() const override;
    void setAssetSyncPlaylistPersistentID(std::shared_ptr<NSNumber> persistentID) override;
    [[nodiscard]] NSUInteger assetSyncLimitType() const override;
    void setAssetSyncLimitType(NSUInteger type) override;
    [[nodiscard]] std::shared_ptr<NSNumber> assetSyncLimit() const override;
    void setAssetSyncLimit(std::shared_ptr<NSNumber> limit) override;
    [[nodiscard]] std::shared_ptr<NSNumber>
    lastFullySentAssetSyncPlaylistPersistentID() const override;
    [[nodiscard]] std::shared_ptr<NSNumber> lastFullySentAssetSyncPlaylistVersion() const override;

  private:
    Journal& journal_;
};

} // namespace quorl::tests
