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

/// The other way round.
[[nodiscard]] inline timespec timeOf(std::int64_t nanoseconds) {
    constexpr std::int64_t second = 1'000'000'000;
    const auto rest = nanoseconds % second;
    const auto seconds = nanoseconds / second - (rest < 0 ? 1 : 0);
    return {static_cast<time_t>(seconds), static_cast<long>(rest < 0 ? rest + second : rest)};
}

/// What tells one state of a file's contents from another.
struct FileState {
    /// In bytes.
    std::uint64_t size = 0;
    /// Nanoseconds since 1970, as `nanoseconds` gives them.
    std::int64_t modified = 0;

    bool operator==(const FileState&) const = default;
};

[[nodiscard]] inline FileState stateOf(const FileStatus& status) {
    return {static_cast<std::uint64_t>(status.st_size), nanoseconds(status.st_mtim)};
}

} // namespace quorl::base
