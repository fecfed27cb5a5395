#include "quorl/adapters/LibraryPlaylist.h"

#include <array>

#include "quorl/adapters/LibraryItems.h"

namespace quorl {

namespace {

NSNumber::Value truth(bool value) { return std::uint64_t{value ? 1U : 0U}; }

} // namespace

LibraryPlaylist::LibraryPlaylist(std::shared_ptr<const media::Inventory> inventory,
                                 const media::Playlist& playlist)
    : inventory_(std::move(inventory)),
      playlist_(&playlist),
      identifier_(playlist.id),
      revision_(playlist.revision),
      isFolder_(truth(playlist.folder)),
      isMix_(truth(playlist.generated == media::Generated::Mix)),
      isGenerated_(truth(playlist.generated == media::Generated::Playlist)) {}

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
    const std::array<std::pair<MPMediaProperty, NSNumber*>, 5> values{
        {{MPMediaPlaylistPropertyPersistentID, &identifier_},
         {MPMediaEntityPropertyEntityRevision, &revision_},
         {MPMediaPlaylistPropertyIsFolder, &isFolder_},
         {MPMediaPlaylistPropertyIsAugurMix, &isMix_},
         {MPMediaPlaylistPropertyIsAugurPlaylist, &isGenerated_}}};
    for (const auto& [name, number] : values) {
        if (name == property) {
            return {std::const_pointer_cast<NSObject>(shared_from_this()), number};
        }
    }
    return nullptr;
}

std::optional<std::string> LibraryPlaylist::name() const { return playlist_->name; }

NSArray<MPMediaItem> LibraryPlaylist::items() const {
    if (!items_) {
        items_ = makeItems(inventory_, playlist_->songs);
    }
    return items_;
}

} // namespace quorl
