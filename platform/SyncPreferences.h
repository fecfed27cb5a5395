#pragma once

#include "platform/Foundation.h"

/// The preferences that the panes and the sync engine share. Another process may change any of them
/// at any time; a getter gives what this process has stored last, or what another has, at the
/// latest when that is announced. Main thread only.
class LMSyncDefaults : public NSObject {
  public:
    /// The one object of the process.
    [[nodiscard]] static LMSyncDefaults& sharedDefaults();

    /// Whether music goes to the wearable at all.
    [[nodiscard]] virtual bool isAssetSyncEnabled() const = 0;
    virtual void setAssetSyncEnabled(bool enabled) = 0;

    /// The 64-bit id of the playlist chosen for sync; null for none.
    [[nodiscard]] virtual std::shared_ptr<NSNumber> assetSyncPlaylistPersistentID() const = 0;
    virtual void setAssetSyncPlaylistPersistentID(std::shared_ptr<NSNumber> persistentID) = 0;

    /// What the limit counts: 0 megabytes, 1 songs.
    [[nodiscard]] virtual NSUInteger assetSyncLimitType() const = 0;
    virtual void setAssetSyncLimitType(NSUInteger type) = 0;

    /// The limit, in the unit of its type; null counts as 0.
    [[nodiscard]] virtual std::shared_ptr<NSNumber> assetSyncLimit() const = 0;
    virtual void setAssetSyncLimit(std::shared_ptr<NSNumber> limit) = 0;

    /// The id and the revision of the playlist that the sync engine last sent in full; null when
    /// there was none. Only the engine writes them.
    [[nodiscard]] virtual std::shared_ptr<NSNumber>
    lastFullySentAssetSyncPlaylistPersistentID() const = 0;
    [[nodiscard]] virtual std::shared_ptr<NSNumber>
    lastFullySentAssetSyncPlaylistVersion() const = 0;
};

/// Posted on the main thread, with no object, after any change of a value: once for each setter
/// that changed one, after the setter has returned, and once for each change by another process. A
/// setter that stores an equal value announces nothing.
extern const NSNotificationName LMSyncPreferencesDidChangeNotification;
