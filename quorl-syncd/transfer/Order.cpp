#include "quorl-syncd/transfer/Order.h"

#include "services/preferences/Limit.h"

namespace quorl::syncd {

std::vector<media::SongIndex> songsWithinLimit(const Order& order) {
    if (order.isRemoval()) {
        return {};
    }
    const auto limit = preferences::limitOf(order.selection.limitType, order.selection.limit);
    const auto& songs = order.playlist().songs;
    const auto count = order.library->songsWithin(order.playlist(), limit.bytes, limit.songs);
    return {songs.begin(), songs.begin() + static_cast<std::ptrdiff_t>(count)};
}

} // namespace quorl::syncd
