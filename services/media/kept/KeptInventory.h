#pragma once

#include <filesystem>
#include <memory>

#include "services/media/Inventory.h"

/// What a music folder held when it was last read, in a file, so that there is something to show
/// before it has been read again.
namespace quorl::media {

/// The inventory of the music folder at `root` that is kept in `file`; null where there is none of
/// that folder, or none that can be used. Nobody has looked at the folder. Any thread.
[[nodiscard]] std::shared_ptr<const Inventory> keptInventory(const std::filesystem::path& file,
                                                             const std::filesystem::path& root);

/// Puts an inventory in the place of the one in `file`, whose directory is made where it is not
/// there. Any thread. Throws `std::system_error`.
void keepInventory(const std::filesystem::path& file, const Inventory& inventory);

} // namespace quorl::media
