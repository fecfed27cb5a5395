#include "quorl/facts/OfferedPlaylists.h"

#include <algorithm>
#include <iterator>

#include "services/base/Utf8.h"

namespace quorl {

namespace {

using Playlists = std::vector<const media::Playlist*>;

template <class Predicate>
Playlists filtered(const Playlists& playlists, Predicate predicate) {
    Playlists matching;
    std::copy_if(playlists.begin(), playlists.end(), std::back_inserter(matching), predicate);
    return matching;
}

std::string ambiguous(const std::string& name, const Playlists& playlists) {
    std::string text = "Several playlists are called " + base::printable(name) +
                       ". Give the id of one of them instead:";
    for (const auto* playlist : playlists) {
        text += "\n  " + std::to_string(playlist->id) + "  " + base::printable(playlist->path);
    }
    return text;
}

} // namespace

Playlists offeredIn(const media::Inventory& inventory) {
    Playlists offered;
    for (const auto& playlist : inventory.playlists) {
        if (!playlist.folder && playlist.generated == media::Generated::No) {
            offered.push_back(&playlist);
        }
    }
    return offered;
}

std::variant<const media::Playlist*, std::string> findOffered(const media::Inventory& inventory,
                                                              const std::string& nameOrID) {
    const auto offered = offeredIn(inventory);
    const auto name = base::composed(nameOrID);
    auto found = filtered(
        offered, [&](const auto* playlist) { return base::composed(playlist->name) == name; });
    if (found.empty()) {
        found = filtered(offered, [&](const auto* playlist) {
            return std::to_string(playlist->id) == nameOrID;
        });
    }
    if (found.size() > 1) {
        return ambiguous(nameOrID, found);
    }
    return found.empty() ? std::variant<const media::Playlist*, std::string>(
                               "There is no playlist called " + base::printable(nameOrID) +
                               ". 'quorl --playlists' lists those that can be chosen.")
                         : found.front();
}

} // namespace quorl
