#pragma once

#include <array>

#include "platform/SyncPreferences.h"
#include "runtime/services/SyncPreference.h"

namespace quorl {

/// Where a host keeps the shared preferences. Main thread only.
class SyncPreferencesStore {
  public:
    virtual ~SyncPreferencesStore() = default;

    /// What is stored; null for nothing. A truth value is 0 or 1. What another process has stored
    /// is there at the latest when `SyncDefaults::announceChange` tells of it.
    [[nodiscard]] virtual std::optional<std::uint64_t> value(SyncPreference preference) const = 0;

    /// Stores a value, null to clear it. Whether that has changed what was stored: false also where
    /// it failed, which the store has told the user.
    [[nodiscard]] virtual bool setValue(SyncPreference preference,
                                        std::optional<std::uint64_t> value) = 0;
};

/// The process's view of the shared preferences over a host's store: typed accessors, and one
/// `LMSyncPreferencesDidChangeNotification` on the main queue for each setter that changed a value.
class SyncDefaults : public LMSyncDefaults {
  public:
    /// `store` outlives this object.
    explicit SyncDefaults(SyncPreferencesStore& store) : store_(store) {}

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

    /// Queues one announcement on the main queue. For the host, when another process has changed
    /// something. Any thread.
    static void announceChange();

  private:
    [[nodiscard]] std::shared_ptr<NSNumber> number(SyncPreference preference) const;
    void set(SyncPreference preference, std::optional<std::uint64_t> value);

    SyncPreferencesStore& store_;
    mutable std::array<std::shared_ptr<NSNumber>, syncPreferences.size()> numbers_; ///< given last
};

} // namespace quorl
