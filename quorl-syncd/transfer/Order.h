#pragma once

#include <memory>
#include <span>

#include "services/media/Inventory.h"
#include "services/wearable/Manifest.h"
#include "services/wearable/Wearable.h"

namespace quorl::syncd {

/// What is to be on which wearable.
struct Order {
    /// Not null; has the playlist in the revision of the selection.
    std::shared_ptr<const media::Inventory> library;
    /// Of no playlist where nothing of ours is to be there.
    wearable::Selection selection;
    wearable::Wearable wearable;

    [[nodiscard]] bool isRemoval() const { return selection == wearable::Selection(); }

    /// Where it is no removal.
    [[nodiscard]] const media::Playlist& playlist() const {
        return *library->playlist(selection.playlist);
    }
};

/// The songs from the top of the playlist to the first one that does not fit, as the pane's footer
/// counts them; later ones are not tried. A song that is listed twice counts twice. None for a
/// removal. They live as long as the library is there.
[[nodiscard]] std::span<const media::SongIndex> songsWithinLimit(const Order& order);

} // namespace quorl::syncd
