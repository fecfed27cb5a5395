#pragma once

#include <algorithm>
#include <cstdint>
#include <ctime>

#include <sys/stat.h>

namespace quorl::base {

/// What `stat` tells of a file. The function and the structure share their name.
using FileStatus = struct stat;

/// `time` in nanoseconds since 1970. A time beyond the years 1700 to 2240, which only a damaged or
/// a hostile file has, counts as the nearest within them.
[[nodiscard]] inline std::int64_t nanoseconds(const timespec& time) {
    constexpr std::int64_t limit = 8'500'000'000;
    const auto seconds = std::clamp(std::int64_t{time.tv_sec}, -limit, limit);
    return seconds * 1'000'000'000 + time.tv_nsec;
}

} // namespace quorl::base
