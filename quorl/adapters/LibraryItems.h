#pragma once

#include "platform/MediaLibrary.h"
#include "services/media/Inventory.h"

namespace quorl {

/// The songs of a playlist as the platform's items, in playlist order: all of them in two pieces of
/// memory, however many they are. The items keep `inventory` alive. Main thread.
[[nodiscard]] NSArray<MPMediaItem> makeItems(std::shared_ptr<const media::Inventory> inventory,
                                             const std::vector<media::SongIndex>& songs);

} // namespace quorl
