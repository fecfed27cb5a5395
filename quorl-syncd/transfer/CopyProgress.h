#pragma once

#include <cstdint>
#include <string>

namespace quorl::syncd {

/// How far the whole choice has come, with what was on the wearable already.
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
