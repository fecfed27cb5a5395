#pragma once

#include <filesystem>

#include "services/base/Purpose.h"

namespace quorl {

/// What the command line says of where the app finds what it works with. Absolute.
struct Places {
    std::filesystem::path music;    ///< the music folder; empty for the one that was chosen
    std::filesystem::path wearable; ///< a mounted wearable; empty for the one that was chosen
    std::filesystem::path plugins;  ///< searched before all others; empty for none

    /// Other places than the chosen ones are for a trial.
    [[nodiscard]] base::Purpose purpose() const {
        return music.empty() && wearable.empty() ? base::Purpose::Use : base::Purpose::Trial;
    }
};

} // namespace quorl
