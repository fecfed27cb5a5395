#pragma once

#include <cstdint>
#include <limits>
#include <vector>

#include "services/preferences/Preference.h"

/// Which songs of a playlist fit within a limit: what the pane says and what the engine sends.
namespace quorl::limits {

/// A song of a playlist. Two of the same number are one song that is listed twice.
struct Listed {
    int song;
    std::uint64_t size;
};

struct Case {
    const char* situation;
    std::uint64_t kind;
    std::uint64_t amount;
    std::vector<Listed> playlist;
    /// From the top of the playlist on.
    std::uint64_t songs;
    std::uint64_t bytes;
};

inline constexpr std::uint64_t megabytes = preferences::LimitType::Megabytes;
inline constexpr std::uint64_t songs = preferences::LimitType::Songs;
inline constexpr std::uint64_t megabyte = 1 << 20;
inline constexpr std::uint64_t largest = std::numeric_limits<std::uint64_t>::max();
inline constexpr std::uint64_t half = std::uint64_t{1} << 63;

inline const std::vector<Case> cases{
    {"empty playlist", megabytes, 100, {}, 0, 0},
    {"no songs allowed", songs, 0, {{1, 1}, {2, 2}}, 0, 0},
    {"no songs allowed, of no size", songs, 0, {{1, 0}}, 0, 0},
    {"no megabytes allowed", megabytes, 0, {{1, 1}, {2, 2}}, 0, 0},
    {"no megabytes allowed, songs of no size", megabytes, 0, {{1, 0}, {2, 0}}, 2, 0},
    {"first song too large, a later one not", megabytes, 1, {{1, 2 * megabyte}, {2, 1}}, 0, 0},
    {"later song too large, a still later one not",
     megabytes,
     10,
     {{1, 4 * megabyte}, {2, 5 * megabyte}, {3, 2 * megabyte}, {4, 1}},
     2,
     9 * megabyte},
    {"exactly full", megabytes, 3, {{1, megabyte}, {2, 2 * megabyte}}, 2, 3 * megabyte},
    {"exactly full, and a song of no size", megabytes, 1, {{1, megabyte}, {2, 0}}, 2, megabyte},
    {"passed by one byte",
     megabytes,
     3,
     {{1, megabyte}, {2, megabyte}, {3, megabyte + 1}},
     2,
     2 * megabyte},
    {"fewer songs than allowed", songs, 250, {{1, 5}, {2, 6}}, 2, 11},
    {"as many songs as allowed", songs, 3, {{1, 10}, {2, 20}, {3, 30}}, 3, 60},
    {"more songs than allowed", songs, 2, {{1, 10}, {2, 20}, {3, 30}}, 2, 30},
    {"songs of any size, where songs are counted", songs, 1, {{1, half}, {2, 1}}, 1, half},
    {"unknown kind", 2, 1, {{1, 10 * megabyte}, {2, 20 * megabyte}}, 2, 30 * megabyte},
    {"largest kind", largest, 0, {{1, 10}, {2, 20}}, 2, 30},
    {"song listed twice counts twice", songs, 2, {{1, 5}, {1, 5}, {2, 6}}, 2, 10},
    {"song listed twice takes its size twice",
     megabytes,
     1,
     {{1, megabyte / 2}, {1, megabyte / 2}, {2, 1}},
     2,
     megabyte},
    {"more bytes than 32 bits hold",
     megabytes,
     8192,
     {{1, 5000 * megabyte}, {2, 3000 * megabyte}},
     2,
     8000 * megabyte},
    // Amounts and sums of 64 bits wrap around.
    {"amount of just too many bytes for 64 bits",
     megabytes,
     std::uint64_t{1} << 44,
     {{1, 1}},
     0,
     0},
    {"amount of which 64 bits keep one megabyte",
     megabytes,
     (std::uint64_t{1} << 44) + 1,
     {{1, megabyte}, {2, 1}},
     1,
     megabyte},
    {"largest amount",
     megabytes,
     largest,
     {{1, half}, {2, half - megabyte}},
     2,
     largest - megabyte + 1},
    {"sum of sizes that passes 64 bits",
     megabytes,
     1,
     {{1, megabyte}, {2, largest}},
     2,
     megabyte - 1},
};

} // namespace quorl::limits
