#include "quorl/adapters/Library.h"

#include <unordered_map>

#include "platform/Dispatch.h"
#include "quorl/adapters/LibraryPlaylist.h"

namespace quorl {

namespace {

using Playlists = std::vector<std::shared_ptr<LibraryPlaylist>>;

/// The playlists of `snapshot`. Those of `before` that are unchanged stay the objects they were.
Playlists playlistsOf(const std::shared_ptr<const media::Snapshot>& snapshot,
                      const Playlists& before) {
    std::unordered_map<std::uint64_t, std::shared_ptr<LibraryPlaylist>> known;
    for (const auto& playlist : before) {
        known.emplace(playlist->persistentID(), playlist);
    }
    Playlists playlists;
    playlists.reserve(snapshot->playlists.size());
    for (const media::Playlist& entry : snapshot->playlists) {
        const auto found = known.find(entry.id);
        if (found != known.end() && found->second->isSame(entry)) {
            found->second->moveTo(snapshot, entry);
            playlists.push_back(found->second);
        } else {
            playlists.push_back(std::make_shared<LibraryPlaylist>(snapshot, entry));
        }
    }
    return playlists;
}

} // namespace

void Library::open(const std::filesystem::path& root, Taken taken) {
    taken_ = std::move(taken);
    // Held weakly: a snapshot on its way keeps no library alive.
    folder_ = std::make_unique<media::MusicFolder>(
        root, [reference = weak(this)](std::shared_ptr<const media::Snapshot> snapshot) {
            dispatch_async(dispatch_get_main_queue(), [reference, snapshot = std::move(snapshot)] {
                if (const auto self = reference.lock()) {
                    self->take(snapshot);
                }
            });
        });
}

void Library::take(std::shared_ptr<const media::Snapshot> snapshot) {
    playlists_ = playlistsOf(snapshot, playlists_);
    snapshot_ = std::move(snapshot);
    contentsDidChange();
    taken_(*snapshot_);
}

bool Library::hasMediaOfType(NSUInteger mask) const {
    return snapshot_ && (((mask & MPMediaTypeMusic) != 0 && snapshot_->hasAudio) ||
                         ((mask & MPMediaTypeMusicVideo) != 0 && snapshot_->hasMusicVideo));
}

NSArray<MPMediaPlaylist> Library::playlistsMatching(const Predicates& predicates) const {
    std::vector<std::shared_ptr<MPMediaPlaylist>> matching;
    for (const auto& playlist : playlists_) {
        if (fulfils(*playlist, predicates)) {
            matching.push_back(playlist);
        }
    }
    return std::make_shared<const std::vector<std::shared_ptr<MPMediaPlaylist>>>(
        std::move(matching));
}

} // namespace quorl
