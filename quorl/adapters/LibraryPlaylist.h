#pragma once

#include "platform/MediaLibrary.h"
#include "services/media/Inventory.h"

namespace quorl {

/// A playlist, or a folder of playlists, of an inventory of the music folder. Main thread.
class LibraryPlaylist final : public MPMediaPlaylist {
  public:
    /// `playlist` is one of `inventory`, which is kept alive.
    LibraryPlaylist(std::shared_ptr<const media::Inventory> inventory,
                    const media::Playlist& playlist);

    /// Whether `playlist`, of any inventory, says what this one says.
    [[nodiscard]] bool isSame(const media::Playlist& playlist) const;

    /// Takes the place of `isSame` playlist in another inventory, and lets go of the one before.
    void moveTo(std::shared_ptr<const media::Inventory> inventory, const media::Playlist& playlist);

    /// Gives the number of a property; allocates nothing.
    using Reader = const std::shared_ptr<NSNumber>& (*)(const LibraryPlaylist& playlist);

    /// How a property is read of every playlist; null for one that playlists lack.
    [[nodiscard]] static Reader readerOf(MPMediaProperty property);

    [[nodiscard]] std::uint64_t persistentID() const override;
    [[nodiscard]] std::shared_ptr<NSObject>
    valueForProperty(MPMediaProperty property) const override;
    [[nodiscard]] std::optional<std::string> name() const override;

    /// Made at the first call.
    [[nodiscard]] NSArray<MPMediaItem> items() const override;

  private:
    std::shared_ptr<const media::Inventory> inventory_;
    const media::Playlist* playlist_; ///< in `inventory_`
    mutable NSArray<MPMediaItem> items_;

    // Handed out; a number never changes.
    std::shared_ptr<NSNumber> identifier_;
    std::shared_ptr<NSNumber> revision_;
};

/// Those of `playlists` that fulfil every predicate; never null.
[[nodiscard]] NSArray<MPMediaPlaylist>
matching(std::span<const std::shared_ptr<LibraryPlaylist>> playlists,
         std::span<const std::shared_ptr<MPMediaPropertyPredicate>> predicates);

} // namespace quorl
