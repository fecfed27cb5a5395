#include "services/media/Inventory.h"

#include <algorithm>
#include <numeric>

namespace quorl::media {

std::string Song::path() const {
    std::string path(directory);
    if (!path.empty()) {
        path += '/';
    }
    return path.append(name);
}

Song SongTable::operator[](SongIndex index) const {
    const Record& record = records_[index];
    return {directories_[record.directory], names_[index], record.size, record.modified,
            record.kind};
}

SongIndex SongTable::add(std::uint32_t directory, const Song& song) {
    records_.push_back({song.size, song.modified, directory, song.kind});
    return names_.add(song.name);
}

void SongTable::shrink() {
    directories_.shrink();
    names_.shrink();
    records_.shrink_to_fit();
}

const Playlist* Inventory::playlist(std::uint64_t id) const {
    const auto found = std::ranges::find(playlists, id, &Playlist::id);
    return found == playlists.end() ? nullptr : &*found;
}

std::uint64_t Inventory::bytesOf(const Playlist& playlist) const {
    return std::accumulate(
        playlist.songs.begin(), playlist.songs.end(), std::uint64_t{0},
        [this](std::uint64_t sum, SongIndex song) { return sum + songs[song].size; });
}

std::string Inventory::unwatchedNotice() const {
    if (unwatchedDirectories == 0) {
        return {};
    }
    const std::string count = unwatchedDirectories == 1
                                  ? "1 directory"
                                  : std::to_string(unwatchedDirectories) + " directories";
    return "Changes in " + count +
           " of the music folder go unnoticed, because the system watches no more directories. "
           "Raise fs.inotify.max_user_watches, or rescan after a change.";
}

} // namespace quorl::media
