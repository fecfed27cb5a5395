#pragma once

#include "platform/MediaLibrary.h"

/// The synced playlist as last resolved, attached to the sync preferences and owned by them. It
/// forgets the playlist whenever the media library announces a change. Main thread only.
class _LMSyncDefaultsAssociatedObject : public NSObject {
  public:
    ~_LMSyncDefaultsAssociatedObject() override;

    [[nodiscard]] bool init() override;

    /// Null where none is remembered.
    [[nodiscard]] const std::shared_ptr<MPMediaPlaylist>& assetSyncPlaylist() const {
        return _assetSyncPlaylist;
    }

    void setAssetSyncPlaylist(std::shared_ptr<MPMediaPlaylist> playlist) {
        _assetSyncPlaylist = std::move(playlist);
    }

  private:
    void _mediaLibraryDidChangeNotification(const NSNotification& notification);

    std::shared_ptr<MPMediaPlaylist> _assetSyncPlaylist;
};
