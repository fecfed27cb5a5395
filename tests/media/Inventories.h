#pragma once

#include <string>
#include <string_view>
#include <vector>

#include "services/media/Inventory.h"

namespace quorl::media::test {

/// The playlist, or folder, of this path; throws where there is none.
[[nodiscard]] const Playlist& playlistAt(const Inventory& inventory, std::string_view path);

/// The paths of the songs in the playlist of this path.
[[nodiscard]] std::vector<std::string> songsOf(const Inventory& inventory, std::string_view path);

/// The names of all playlists, in order.
[[nodiscard]] std::vector<std::string> namesOf(const Inventory& inventory);

/// The reasons for which entries of the playlist of this path are left out, in order.
[[nodiscard]] std::vector<Reason> reasonsFor(const Inventory& inventory, std::string_view path);

} // namespace quorl::media::test
