#include "quorl/facts/FolderTrouble.h"

#include <algorithm>

#include "services/base/Utf8.h"

namespace quorl {

bool isUnreadable(const media::Inventory& inventory) {
    return std::ranges::any_of(inventory.leftOut, [](const media::LeftOut& leftOut) {
        return leftOut.reason == media::Reason::DirectoryUnreadable && leftOut.playlist.empty();
    });
}

std::string troubleIn(const media::Inventory& inventory) {
    const auto root = base::printable(inventory.root.string());
    if (!inventory.rootFound) {
        return "There is no music folder at " + root + ". Create it, or choose another one.";
    }
    if (isUnreadable(inventory)) {
        return "The music folder " + root +
               " cannot be read. Change its permissions, or choose another one.";
    }
    return inventory.playlists.empty()
               ? "There are no playlists in the music folder " + root +
                     ". Put M3U, PLS or XSPF files into it, or choose another one."
               : "";
}

} // namespace quorl
