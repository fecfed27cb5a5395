#include "quorl/facts/FolderTrouble.h"

#include <algorithm>

#include "services/base/Utf8.h"
#include "services/language/Translated.h"

namespace quorl {

using language::filled;
using language::translated;

bool isUnreadable(const media::Inventory& inventory) {
    return std::ranges::any_of(inventory.leftOut, [](const media::LeftOut& leftOut) {
        return leftOut.reason == media::Reason::DirectoryUnreadable && leftOut.playlist.empty();
    });
}

std::string troubleIn(const media::Inventory& inventory) {
    const auto root = base::printable(inventory.root.string());
    if (!inventory.rootFound) {
        return filled(
            translated("There is no music folder at {folder}. Create it, or choose another one."),
            {{"folder", root}});
    }
    if (isUnreadable(inventory)) {
        return filled(translated("The music folder {folder} cannot be read. Change its "
                                 "permissions, or choose another one."),
                      {{"folder", root}});
    }
    return inventory.playlists.empty()
               ? filled(translated("There are no playlists in the music folder {folder}. Put M3U, "
                                   "PLS or XSPF files into it, or choose another one."),
                        {{"folder", root}})
               : "";
}

} // namespace quorl
