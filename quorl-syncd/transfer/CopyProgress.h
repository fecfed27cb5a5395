#pragma once

#include <cstdint>
#include <string>

namespace quorl::syncd {

/// How far the copying has come. Songs and bytes that were already on the wearable are not counted.
struct CopyProgress {
    std::uint64_t songs = 0;
    std::uint64_t totalSongs = 0;
    std::uint64_t bytes = 0;
    std::uint64_t totalBytes = 0;
    /// That is being copied: its path in the music folder; empty for none.
    std::string song = {};

    bool operator==(const CopyProgress&) const = default;
};

} // namespace quorl::syncd
