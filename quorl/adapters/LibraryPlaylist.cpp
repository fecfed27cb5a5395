#include "quorl/adapters/LibraryPlaylist.h"

#include "quorl/adapters/LibraryItems.h"

namespace quorl {

LibraryPlaylist::LibraryPlaylist(std::shared_ptr<const media::Inventory> inventory,
                                 const media::Playlist& playlist)
    : inventory_(std::move(inventory)),
      playlist_(&playlist),
      identifier_(NSNumber::numberWithUnsignedLongLong(playlist.id)),
      revision_(NSNumber::numberWithUnsignedLongLong(playlist.revision)) {}

bool LibraryPlaylist::isSame(const media::Playlist& playlist) const {
    return playlist.id == playlist_->id && playlist.revision == playlist_->revision &&
           playlist.name == playlist_->name && playlist.folder == playlist_->folder &&
           playlist.generated == playlist_->generated;
}

void LibraryPlaylist::moveTo(std::shared_ptr<const media::Inventory> inventory,
                             const media::Playlist& playlist) {
    inventory_ = std::move(inventory);
    playlist_ = &playlist;
    items_ = nullptr; // they keep the inventory before alive
}

std::uint64_t LibraryPlaylist::persistentID() const { return playlist_->id; }

std::shared_ptr<NSObject> LibraryPlaylist::valueForProperty(MPMediaProperty property) const {
    if (property == MPMediaPlaylistPropertyIsFolder) {
        return NSNumber::numberWithBool(playlist_->folder);
    }
    if (property == MPMediaPlaylistPropertyIsAugurMix) {
        return NSNumber::numberWithBool(playlist_->generated == media::Generated::Mix);
    }
    if (property == MPMediaPlaylistPropertyIsAugurPlaylist) {
        return NSNumber::numberWithBool(playlist_->generated == media::Generated::Playlist);
    }
    if (property == MPMediaPlaylistPropertyPersistentID) {
        return identifier_;
    }
    return property == MPMediaEntityPropertyEntityRevision ? revision_ : nullptr;
}

std::optional<std::string> LibraryPlaylist::name() const { return playlist_->name; }

NSArray<MPMediaItem> LibraryPlaylist::items() const {
    if (!items_) {
        items_ = makeItems(inventory_, playlist_->songs);
    }
    return items_;
}

} // namespace quorl
