#include "services/media/Inventory.h"

#include <algorithm>
#include <numeric>

#include "services/language/Translated.h"

namespace quorl::media {

namespace {

std::string_view parentOf(std::string_view path) {
    const auto slash = path.rfind('/');
    return slash == std::string_view::npos ? std::string_view() : path.substr(0, slash);
}

/// A directory has no songs, nor has a file whose songs are those of another one.
bool isMissedIn(const Playlist& playlist, const LeftOut& leftOut) {
    if (!playlist.folder) {
        return leftOut.playlist == playlist.path;
    }
    return parentOf(leftOut.playlist) == playlist.path &&
           leftOut.reason != Reason::DirectoryUnreadable && leftOut.reason != Reason::SameAsAnother;
}

} // namespace

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

std::vector<const LeftOut*> Inventory::leftOutOf(const Playlist& playlist) const {
    std::vector<const LeftOut*> found;
    for (const auto& each : leftOut) {
        if (isMissedIn(playlist, each)) {
            found.push_back(&each);
        }
    }
    return found;
}

std::size_t Inventory::songsWithin(const Playlist& playlist, std::uint64_t mostBytes,
                                   std::uint64_t mostSongs) const {
    std::size_t count = 0;
    std::uint64_t bytes = 0;
    for (const auto song : playlist.songs) {
        bytes += songs[song].size;
        if (bytes > mostBytes || count == mostSongs) {
            break;
        }
        ++count;
    }
    return count;
}

std::string Inventory::unwatchedNotice() const {
    if (unwatchedDirectories == 0) {
        return {};
    }
    return language::translatedCount(
        "Changes in {count} directory of the music folder go unnoticed, because the system cannot "
        "watch more directories. Raise fs.inotify.max_user_watches, or rescan after a change.",
        "Changes in {count} directories of the music folder go unnoticed, because the system "
        "cannot watch more directories. Raise fs.inotify.max_user_watches, or rescan after a "
        "change.",
        unwatchedDirectories);
}

} // namespace quorl::media
