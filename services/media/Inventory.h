#pragma once

#include <cstddef>
#include <cstdint>
#include <filesystem>
#include <string>
#include <string_view>
#include <vector>

#include "services/media/playlists/Generated.h"
#include "services/media/playlists/LeftOut.h"
#include "services/media/playlists/TextList.h"

namespace quorl::media {

enum class Kind : std::uint8_t { Audio, MusicVideo };

/// The place of a song in `Inventory::songs`. Means nothing in another inventory.
using SongIndex = std::uint32_t;

/// A song, as views into the table that gave it.
struct Song {
    /// The directory's path relative to the music folder, in the bytes of the file system; empty
    /// for the music folder itself.
    std::string_view directory;
    std::string_view name;
    /// In bytes.
    std::uint64_t size;
    /// Modification time in nanoseconds since 1970.
    std::int64_t modified;
    Kind kind;

    /// The path relative to the music folder.
    [[nodiscard]] std::string path() const;
};

/// Songs in little memory: each directory's path is kept once.
class SongTable {
  public:
    [[nodiscard]] std::size_t size() const { return records_.size(); }

    [[nodiscard]] Song operator[](SongIndex index) const;

    /// The directories, by their indices.
    [[nodiscard]] const TextList& directories() const { return directories_; }

    /// The index of the song's directory.
    [[nodiscard]] std::uint32_t directoryOf(SongIndex index) const {
        return records_[index].directory;
    }

    /// Appends a directory, in which songs can then be added; gives its index.
    std::uint32_t addDirectory(std::string_view path) { return directories_.add(path); }

    /// Appends `song` with the given directory in place of the song's own.
    SongIndex add(std::uint32_t directory, const Song& song);

    /// Gives back memory that is held for further songs.
    void shrink();

    bool operator==(const SongTable&) const = default;

  private:
    struct Record {
        std::uint64_t size;
        std::int64_t modified;
        std::uint32_t directory;
        Kind kind;

        bool operator==(const Record&) const = default;
    };

    TextList directories_;
    TextList names_;
    std::vector<Record> records_;
};

/// A playlist, or a folder of playlists.
struct Playlist {
    /// Never 0. The same on every machine and after every restart as long as the playlist keeps its
    /// path in the music folder, whatever happens to its contents and in whichever Unicode
    /// normalisation the file system stores the path. No two playlists of an inventory share one.
    std::uint64_t id = 0;
    /// Differs whenever the songs, their order, their sizes or their modification times differ, and
    /// only then. Comparable over restarts.
    std::uint64_t revision = 0;
    /// What to show, in UTF-8: the name that the file gives itself, else the file name without its
    /// extension; for a folder, the directory's name. Never empty.
    std::string name;
    /// The file's path, or the directory's for a folder, relative to the music folder, in the bytes
    /// of the file system.
    std::string path;
    /// A directory that holds playlists directly. Its songs are those of these playlists, in the
    /// order of the playlists. The music folder itself is none.
    bool folder = false;
    Generated generated = Generated::No;
    /// In playlist order. A song that is listed twice is here twice.
    std::vector<SongIndex> songs;

    bool operator==(const Playlist&) const = default;
};

/// What a music folder held at one moment. Handed out as `std::shared_ptr<const Inventory>`: nobody
/// changes it, any thread may read it.
struct Inventory {
    /// The music folder, absolute, as the caller gave it.
    std::filesystem::path root;
    /// False: there is no such directory, and everything below is empty.
    bool rootFound = false;
    /// By name, in the collation of the user's locale, then by path.
    std::vector<Playlist> playlists;
    /// The songs that playlists list, each once, in the order in which they are first listed.
    SongTable songs;
    /// What is in no playlist although a playlist names it, and what could not be read; by path of
    /// the playlist, then in the order of its entries.
    std::vector<LeftOut> leftOut;
    /// Whether any file of the folder, in a playlist or not, is of this kind.
    bool hasAudio = false;
    bool hasMusicVideo = false;
    /// Directories whose changes go unnoticed until `MusicFolder::rescan`, because the system
    /// cannot watch more directories. Always 0 for an inventory that nobody keeps up to date.
    std::size_t unwatchedDirectories = 0;

    /// The playlist of this id; null: there is none.
    [[nodiscard]] const Playlist* playlist(std::uint64_t id) const;

    /// The sizes of its songs together, of one that is listed twice both times.
    [[nodiscard]] std::uint64_t bytesOf(const Playlist& playlist) const;

    /// What `playlist` names and does not have, in the order of `leftOut`. They live as long as
    /// this is there.
    [[nodiscard]] std::vector<const LeftOut*> leftOutOf(const Playlist& playlist) const;

    /// How many of its songs there are from the top to the first one with which there would be more
    /// than so many bytes or songs; later ones do not count. One that is listed twice counts twice.
    [[nodiscard]] std::size_t songsWithin(const Playlist& playlist, std::uint64_t mostBytes,
                                          std::uint64_t mostSongs) const;

    /// What to tell a person about `unwatchedDirectories`, in English; empty where there are none.
    [[nodiscard]] std::string unwatchedNotice() const;

    bool operator==(const Inventory&) const = default;
};

} // namespace quorl::media
