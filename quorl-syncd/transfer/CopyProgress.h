#pragma once

#include <cstdint>

namespace quorl::syncd {

/// How far the copying has come. Songs and bytes that were already on the wearable are not counted.
struct CopyProgress {
    std::uint64_t songs = 0;
    std::uint64_t totalSongs = 0;
    std::uint64_t bytes = 0;
    std::uint64_t totalBytes = 0;

    bool operator==(const CopyProgress&) const = default;
};

} // namespace quorl::syncd
