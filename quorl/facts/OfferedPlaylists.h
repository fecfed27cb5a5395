#pragma once

#include <string>
#include <variant>
#include <vector>

#include "services/media/Inventory.h"

namespace quorl {

/// The playlists that a person can choose, in the order in which they are shown: neither folders
/// nor what a program generated. They live as long as the inventory.
[[nodiscard]] std::vector<const media::Playlist*> offeredIn(const media::Inventory& inventory);

/// The offered playlist that has this name, or else this id; or a sentence that says why there is
/// none, or more than one. It lives as long as the inventory.
[[nodiscard]] std::variant<const media::Playlist*, std::string>
findOffered(const media::Inventory& inventory, const std::string& nameOrID);

} // namespace quorl
