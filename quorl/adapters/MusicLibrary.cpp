#include "quorl/adapters/MusicLibrary.h"

#include <unordered_map>

#include "platform/Dispatch.h"
#include "quorl/adapters/LibraryPlaylist.h"

namespace quorl {

namespace {

using Playlists = std::vector<std::shared_ptr<LibraryPlaylist>>;

/// The playlists of `inventory`. Those of `before` that are unchanged stay the objects they were.
Playlists playlistsOf(const std::shared_ptr<const media::Inventory>& inventory,
                      const Playlists& before) {
    std::unordered_map<std::uint64_t, std::shared_ptr<LibraryPlaylist>> known;
    for (const auto& playlist : before) {
        known.emplace(playlist->persistentID(), playlist);
    }
    Playlists playlists;
    playlists.reserve(inventory->playlists.size());
    for (const media::Playlist& entry : inventory->playlists) {
        const auto found = known.find(entry.id);
        if (found != known.end() && found->second->isSame(entry)) {
            found->second->moveTo(inventory, entry);
            playlists.push_back(found->second);
        } else {
            playlists.push_back(std::make_shared<LibraryPlaylist>(inventory, entry));
        }
    }
    return playlists;
}

} // namespace

MusicLibrary::~MusicLibrary() {
    folder_.reset();
    if (keeper_) {
        keeper_->keepLast();
    }
}

void MusicLibrary::open(const std::filesystem::path& root, Taken taken) {
    taken_ = std::move(taken);
    const auto keeper =
        keptFile_.empty() ? nullptr : std::make_shared<media::InventoryKeeper>(keptFile_, root);
    // Before there is a folder, whose thread has the keeper from then on.
    const auto kept = keeper ? keeper->kept() : nullptr;
    // Held weakly: an inventory on its way keeps no library alive.
    folder_ = std::make_unique<media::MusicFolder>(
        root, [reference = weak(this), number = ++foldersOpened_,
               keeper](const std::shared_ptr<const media::Inventory>& inventory) {
            dispatch_async(dispatch_get_main_queue(), [reference, number, inventory] {
                const auto self = reference.lock();
                if (self && self->foldersOpened_ == number) {
                    self->take(inventory);
                }
            });
            if (keeper) {
                keeper->take(inventory);
            }
        });
    keeper_ = keeper;
    if (!inventory_ && kept) {
        show(kept);
    }
}

void MusicLibrary::show(std::shared_ptr<const media::Inventory> inventory) {
    playlists_ = playlistsOf(inventory, playlists_);
    inventory_ = std::move(inventory);
    contentsDidChange();
}

void MusicLibrary::take(std::shared_ptr<const media::Inventory> inventory) {
    isRead_ = true;
    show(std::move(inventory));
    taken_(*inventory_);
}

bool MusicLibrary::hasMediaOfType(NSUInteger mask) const {
    return inventory_ && (((mask & MPMediaTypeMusic) != 0 && inventory_->hasAudio) ||
                          ((mask & MPMediaTypeMusicVideo) != 0 && inventory_->hasMusicVideo));
}

NSArray<MPMediaPlaylist> MusicLibrary::playlistsMatching(const Predicates& predicates) const {
    return matching(playlists_, predicates);
}

} // namespace quorl
