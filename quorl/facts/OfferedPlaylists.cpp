#include "quorl/facts/OfferedPlaylists.h"

#include <algorithm>
#include <iterator>

#include "services/base/Utf8.h"
#include "services/language/Translated.h"

namespace quorl {

using language::filled;
using language::translated;

namespace {

using Playlists = std::vector<const media::Playlist*>;

template <class Predicate>
Playlists filtered(const Playlists& playlists, Predicate predicate) {
    Playlists matching;
    std::copy_if(playlists.begin(), playlists.end(), std::back_inserter(matching), predicate);
    return matching;
}

std::string ambiguous(const std::string& name, const Playlists& playlists) {
    auto text = filled(
        translated("Several playlists are called {name}. Give the id of one of them instead:"),
        {{"name", base::printable(name)}});
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
    if (found.empty()) {
        return filled(translated("There is no playlist called {name}. 'quorl --playlists' lists "
                                 "those that can be chosen."),
                      {{"name", base::printable(nameOrID)}});
    }
    return found.front();
}

} // namespace quorl
