#pragma once

#include <limits>

#include "services/preferences/Preference.h"

namespace quorl::preferences {

/// How much of a playlist is synced at most.
struct Limit {
    std::uint64_t bytes = std::numeric_limits<std::uint64_t>::max();
    std::uint64_t songs = std::numeric_limits<std::uint64_t>::max();
};

/// What the stored values mean: a type, and how many of what it counts. A type without a meaning
/// limits nothing.
[[nodiscard]] constexpr Limit limitOf(std::uint64_t type, std::uint64_t amount) {
    constexpr unsigned megabyteShift = 20;
    return type == LimitType::Megabytes ? Limit{.bytes = amount << megabyteShift}
           : type == LimitType::Songs   ? Limit{.songs = amount}
                                        : Limit{};
}

} // namespace quorl::preferences
