#pragma once

#include <string>
#include <vector>

#include "services/media/Inventory.h"
#include "services/preferences/Limit.h"

namespace quorl {

/// What a person may want to know of a playlist before choosing it.
struct PlaylistFacts {
    std::string contents; ///< how many songs, and how large
    std::string fit;      ///< how much of it the limit allows
    std::filesystem::path file;

    [[nodiscard]] bool operator==(const PlaylistFacts&) const = default;
};

[[nodiscard]] PlaylistFacts factsOf(const media::Inventory& inventory,
                                    const media::Playlist& playlist,
                                    const preferences::Limit& limit);

} // namespace quorl
