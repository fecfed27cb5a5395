#pragma once

#include "platform/MediaLibrary.h"
#include "platform/SyncPreferences.h"

/// What the sync preferences gain here: the synced playlist itself, where the preferences store
/// only its id. Main thread only.

/// The playlist that is being synced; null while sync is off, where no id is stored, or where the
/// library holds no playlist of the stored id. The playlist found is remembered with `defaults`
/// until the media library announces a change or another id is stored; that none was found is not.
[[nodiscard]] std::shared_ptr<MPMediaPlaylist> assetSyncPlaylist(LMSyncDefaults& defaults);

/// Makes `playlist` the synced one; null clears the choice. Whether sync is on stays as it is.
void setAssetSyncPlaylist(LMSyncDefaults& defaults,
                          const std::shared_ptr<MPMediaPlaylist>& playlist);
