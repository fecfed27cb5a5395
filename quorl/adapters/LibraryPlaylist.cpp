#include "quorl/adapters/LibraryPlaylist.h"

#include <algorithm>
#include <array>

#include "quorl/adapters/LibraryItems.h"

namespace quorl {

namespace {

const std::array truths{NSNumber::numberWithBool(false), NSNumber::numberWithBool(true)};

const std::shared_ptr<NSNumber>& truth(bool value) { return truths[value ? 1 : 0]; }

/// A predicate as it is asked of many playlists.
struct Condition {
    LibraryPlaylist::Reader read; ///< null: none fulfils it
    const NSNumber* value;

    [[nodiscard]] bool isMet(const LibraryPlaylist& playlist) const {
        if (read == nullptr) {
            return false;
        }
        const NSNumber& number = *read(playlist);
        return &number == value || number.isEqual(value); // of each truth value there is one number
    }
};

} // namespace

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

LibraryPlaylist::Reader LibraryPlaylist::readerOf(MPMediaProperty property) {
    using Number = std::shared_ptr<NSNumber>;
    using Playlist = LibraryPlaylist;
    using media::Generated;
    if (property == MPMediaPlaylistPropertyIsFolder) {
        return [](const Playlist& it) -> const Number& { return truth(it.playlist_->folder); };
    }
    if (property == MPMediaPlaylistPropertyIsAugurMix) {
        return [](const Playlist& it) -> const Number& {
            return truth(it.playlist_->generated == Generated::Mix);
        };
    }
    if (property == MPMediaPlaylistPropertyIsAugurPlaylist) {
        return [](const Playlist& it) -> const Number& {
            return truth(it.playlist_->generated == Generated::Playlist);
        };
    }
    if (property == MPMediaPlaylistPropertyPersistentID) {
        return [](const Playlist& it) -> const Number& { return it.identifier_; };
    }
    if (property == MPMediaEntityPropertyEntityRevision) {
        return [](const Playlist& it) -> const Number& { return it.revision_; };
    }
    return nullptr;
}

std::shared_ptr<NSObject> LibraryPlaylist::valueForProperty(MPMediaProperty property) const {
    const Reader read = readerOf(property);
    return read != nullptr ? read(*this) : nullptr;
}

std::optional<std::string> LibraryPlaylist::name() const { return playlist_->name; }

NSArray<MPMediaItem> LibraryPlaylist::items() const {
    if (!items_) {
        items_ = makeItems(inventory_, playlist_->songs);
    }
    return items_;
}

NSArray<MPMediaPlaylist>
matching(std::span<const std::shared_ptr<LibraryPlaylist>> playlists,
         std::span<const std::shared_ptr<MPMediaPropertyPredicate>> predicates) {
    std::vector<Condition> conditions;
    for (const auto& predicate : predicates) {
        const auto read = LibraryPlaylist::readerOf(predicate->property());
        conditions.push_back({read, predicate->value().get()});
    }
    std::vector<std::shared_ptr<MPMediaPlaylist>> matching;
    for (const auto& playlist : playlists) {
        if (std::ranges::all_of(conditions,
                                [&](const Condition& it) { return it.isMet(*playlist); })) {
            matching.push_back(playlist);
        }
    }
    return std::make_shared<const std::vector<std::shared_ptr<MPMediaPlaylist>>>(
        std::move(matching));
}

} // namespace quorl
