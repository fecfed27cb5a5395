#include "quorl-syncd/transfer/Order.h"

#include <cstdint>
#include <limits>

#include "services/preferences/Preference.h"

namespace quorl::syncd {

namespace {

constexpr std::uint64_t unlimited = std::numeric_limits<std::uint64_t>::max();
constexpr unsigned megabyteShift = 20;

} // namespace

std::vector<media::SongIndex> songsWithinLimit(const Order& order) {
    namespace LimitType = preferences::LimitType;
    const auto [type, amount] = std::pair{order.selection.limitType, order.selection.limit};
    const auto mostBytes = type == LimitType::Megabytes ? amount << megabyteShift : unlimited;
    const auto mostSongs = type == LimitType::Songs ? amount : unlimited;

    std::vector<media::SongIndex> songs;
    std::uint64_t bytes = 0;
    for (const auto song : order.playlist().songs) {
        bytes += order.library->songs[song].size;
        if (bytes > mostBytes || songs.size() == mostSongs) {
            break;
        }
        songs.push_back(song);
    }
    return songs;
}

} // namespace quorl::syncd
