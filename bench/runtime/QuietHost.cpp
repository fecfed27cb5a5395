#include "bench/runtime/QuietHost.h"

#include <algorithm>

namespace quorl::bench {

Library::Library(std::uint64_t count) {
    for (std::uint64_t id = 1; id <= count; ++id) {
        playlists_.push_back(std::make_shared<Playlist>(id));
    }
}

NSArray<MPMediaPlaylist> Library::playlistsMatching(const Predicates& predicates) const {
    std::vector<std::shared_ptr<MPMediaPlaylist>> matching;
    std::copy_if(playlists_.begin(), playlists_.end(), std::back_inserter(matching),
                 [&predicates](const auto& playlist) { return fulfils(*playlist, predicates); });
    return std::make_shared<const std::vector<std::shared_ptr<MPMediaPlaylist>>>(
        std::move(matching));
}

QuietHost::QuietHost() {
    constexpr NSUInteger noLimit = 2;
    defaults_->setAssetSyncEnabled(true);
    defaults_->setAssetSyncPlaylistPersistentID(NSNumber::numberWithUnsignedLongLong(chosen));
    defaults_->setAssetSyncLimitType(noLimit);
}

NSArray<DVSession> QuietHost::sessions(const std::string& /*type*/) {
    return std::make_shared<const std::vector<std::shared_ptr<DVSession>>>();
}

std::shared_ptr<WearableConnection> QuietHost::connectToWearable(dispatch_queue_t /*queue*/) {
    return wearable_.connect();
}

} // namespace quorl::bench
