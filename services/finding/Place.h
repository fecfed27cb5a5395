#pragma once

#include <cstdint>
#include <filesystem>
#include <optional>
#include <vector>

#include "services/finding/Drive.h"

namespace quorl::finding {

/// A directory in which a wearable may be.
struct Place {
    /// Absolute.
    std::filesystem::path directory = {};
    /// It is offered also where no wearable is in it yet: somebody has plugged it in.
    bool isOfferedEmpty = false;
    /// The directories in it may be wearables too.
    bool isLookedInto = false;

    bool operator==(const Place&) const = default;
};

/// What there is to look at, in the order of the mounts. Of a drive that is mounted in several
/// directories, the first one that shows all of it.
/// @param home of the user; empty for none
[[nodiscard]] std::vector<Place> placesIn(const Surroundings& surroundings,
                                          const std::filesystem::path& home);

/// In bytes.
struct Space {
    std::uint64_t capacity = 0;
    /// What an ordinary user may still write.
    std::uint64_t available = 0;

    bool operator==(const Space&) const = default;
};

/// What was found in a place.
struct Find {
    /// Nothing where it could not be told, or there was no answer in time.
    std::optional<Space> space = {};
    /// Those of its directories that have our manifest, itself included.
    std::vector<std::filesystem::path> wearables = {};

    bool operator==(const Find&) const = default;
};

/// Looks at a place. Takes as long as its device takes. What cannot be read is empty.
[[nodiscard]] Find lookAt(const Place& place);

} // namespace quorl::finding
