#pragma once

#include "doubles/CallRecorder.h"

namespace quorl {

/// The runtime's view of the shared preferences, with a recorder. Main thread.
class SyncDefaultsDouble final : public SyncDefaults {
  public:
    /// `store` outlives this object.
    SyncDefaultsDouble(SyncPreferencesStore& store, std::shared_ptr<CallRecorder> recorder)
        : SyncDefaults(store), recorder_(std::move(recorder)) {}

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
    std::shared_ptr<CallRecorder> recorder_;
};

} // namespace quorl
