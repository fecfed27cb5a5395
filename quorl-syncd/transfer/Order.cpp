#include "quorl-syncd/transfer/Order.h"

#include "services/preferences/Limit.h"

namespace quorl::syncd {

std::span<const media::SongIndex> songsWithinLimit(const Order& order) {
    if (order.isRemoval()) {
        return {};
    }
    const auto limit = preferences::limitOf(order.selection.limitType, order.selection.limit);
    const auto& playlist = order.playlist();
    return std::span(playlist.songs)
        .first(order.library->songsWithin(playlist, limit.bytes, limit.songs));
}

} // namespace quorl::syncd
