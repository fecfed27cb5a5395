#pragma once

#include <filesystem>

namespace quorl {

/// Where the app finds what it works with.
struct Places {
    std::filesystem::path music;    ///< the music folder; never empty
    std::filesystem::path wearable; ///< a mounted wearable; empty for the embedded one
    std::filesystem::path plugins;  ///< searched before all others; empty for none
};

} // namespace quorl
