#include "tests/media/Inventories.h"

#include <stdexcept>

namespace quorl::media::test {

const Playlist& playlistAt(const Inventory& inventory, std::string_view path) {
    for (const Playlist& playlist : inventory.playlists) {
        if (playlist.path == path) {
            return playlist;
        }
    }
    throw std::runtime_error("There is no playlist " + std::string(path) + ".");
}

std::vector<std::string> songsOf(const Inventory& inventory, std::string_view path) {
    std::vector<std::string> songs;
    for (const SongIndex song : playlistAt(inventory, path).songs) {
        songs.push_back(inventory.songs[song].path());
    }
    return songs;
}

std::vector<std::string> namesOf(const Inventory& inventory) {
    std::vector<std::string> names;
    for (const Playlist& playlist : inventory.playlists) {
        names.push_back(playlist.name);
    }
    return names;
}

std::vector<Reason> reasonsFor(const Inventory& inventory, std::string_view path) {
    std::vector<Reason> reasons;
    for (const LeftOut& leftOut : inventory.leftOut) {
        if (leftOut.playlist == path) {
            reasons.push_back(leftOut.reason);
        }
    }
    return reasons;
}

} // namespace quorl::media::test
