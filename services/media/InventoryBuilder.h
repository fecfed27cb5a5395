#pragma once

#include <memory>
#include <stop_token>

#include "services/media/FolderTree.h"
#include "services/media/Inventory.h"

namespace quorl::media {

/// Builds an inventory of what `tree` has read. Asks the file system for the size and time of songs
/// that are listed for the first time, and notes them in `tree`. Null: stopped before the end.
[[nodiscard]] std::shared_ptr<const Inventory> buildInventory(FolderTree& tree,
                                                              const std::stop_token& stop);

} // namespace quorl::media
