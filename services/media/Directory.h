#pragma once

#include <cstdint>
#include <limits>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <variant>
#include <vector>

#include <sys/types.h>

#include "services/media/ContentKinds.h"
#include "services/media/Inventory.h"
#include "services/media/NameTable.h"
#include "services/media/playlists/PlaylistContent.h"

namespace quorl::media {

struct Directory;

/// A file that may be listed as a song. Its size and time are asked for only once a playlist lists
/// it.
struct SongFile {
    static constexpr SongIndex notListed = std::numeric_limits<SongIndex>::max();

    std::uint64_t size = 0;
    std::int64_t modified = 0;
    /// What it adds to the revision of a playlist.
    std::uint64_t fingerprint = 0;
    /// Where it is in the inventory that is being built.
    SongIndex song = notListed;
    Kind kind = Kind::Audio;
    /// A playlist lists it, or did.
    bool listed = false;
    /// Whether `size`, `modified` and `fingerprint`, or `obstacle`, are known.
    bool examined = false;
    /// Why it cannot be listed after all; null: it can.
    std::optional<Reason> obstacle;
};

/// What an inventory says of a playlist or a folder apart from its songs.
struct Title {
    std::uint64_t id;
    std::string path;
    std::string name;
    /// What sorts the names as the user's language does.
    std::string order;
};

/// What the entries of a playlist mean, as long as no directory in the tree says otherwise.
struct Meaning {
    /// A song: where its directory is in `holders`, and where it is in `Directory::songs` there.
    struct Found {
        std::uint32_t holder;
        std::uint32_t song;
    };

    using Entry = std::variant<Found, Reason>;

    /// False: nothing below is worth anything.
    bool known = false;
    /// Some entries would mean something else if only a new name appeared in the tree, or if a
    /// directory disappeared besides that of the song.
    bool hangsOnNames = false;
    /// In the order of the entries of the file.
    std::vector<Entry> entries;
    /// Those for which the file system was asked, which may answer otherwise at any time.
    std::vector<std::uint32_t> asked;
    /// Where the songs are; a directory stands there perhaps several times.
    std::vector<Directory*> holders;
};

/// A playlist file, and what was read from it.
struct PlaylistFile {
    /// What tells one state of a file from another.
    struct State {
        ino_t inode = 0;
        std::uint64_t size = 0;
        std::int64_t modified = 0;
        std::int64_t changed = 0;

        bool operator==(const State&) const = default;
    };

    std::string name;
    Format format = Format::M3u;
    State state;
    /// The file has to be looked at, and read where its state is another one.
    bool dirty = true;
    /// The file had not just been written when it was read. While it has, a further write may leave
    /// the state as it is, for clocks of file systems tick slowly.
    bool isQuiet = false;
    /// A reason stands for a file that could not be read.
    std::variant<PlaylistContent, Reason> content = Reason::PlaylistUnreadable;
    /// Null: not made yet from `content`.
    std::optional<Title> title;
    Meaning meaning;
};

/// One directory of a music folder, as it was when it was last read. Hidden entries and symbolic
/// links to directories are not there.
struct Directory {
    /// Null for the music folder itself.
    Directory* parent = nullptr;
    /// Empty for the music folder itself.
    std::string name;
    /// As the parent lists it.
    ino_t inode = 0;
    /// The descriptor of the watch; none: changes go unnoticed.
    std::optional<int> watch;
    /// What is known below may be out of date.
    bool dirty = true;
    /// This directory or one below it has to be visited at the next refresh.
    bool pending = true;
    /// `songs` are others than those that were taken into the last inventory, or in other places.
    bool reshaped = false;
    /// It is no longer in the tree.
    bool gone = false;
    /// It is among the news of its tree.
    bool noted = false;
    /// The directory itself could not be read; it is empty then.
    bool unreadable = false;
    /// There are symbolic links to files.
    bool hasLinks = false;

    NameTable songNames;
    /// By name, as the next two are; each where its name is in `songNames`.
    std::vector<SongFile> songs;
    std::vector<PlaylistFile> playlists;
    std::vector<std::unique_ptr<Directory>> children;
    /// Of `children`, in their places.
    NameTable childNames;
    /// As a folder of playlists; null: not made yet.
    std::optional<Title> title;

    /// Null: there is none of this name.
    [[nodiscard]] Directory* child(std::string_view childName) const;
    [[nodiscard]] SongFile* song(std::string_view songName);

    /// The path relative to the music folder, empty for the folder itself.
    [[nodiscard]] std::string path() const;
    /// The path of `entry` in this directory, relative to the music folder.
    [[nodiscard]] std::string pathOf(std::string_view entry) const;
};

/// Directories that are no longer where they were.
using Dropped = std::vector<std::unique_ptr<Directory>>;

/// What came of reading a directory again.
struct Reading {
    Dropped dropped;
    /// Songs or directories came or went.
    bool otherNames = false;
    /// There are playlists, or were before, or whether the directory can be read is another matter
    /// now.
    bool otherPlaylists = false;
};

/// Reads `directory` again, which is at `path` in the folder at `root`, both without symbolic
/// links.
///
/// Children that are still there are kept as they are, new ones are added as dirty and unread, and
/// those that are gone are given back. So are songs and playlists kept, but have to be asked and
/// read again. A directory that cannot be read ends up empty. Never blocks on a pipe or a device.
[[nodiscard]] Reading readDirectory(Directory& directory, const std::string& path,
                                    const std::string& root, ContentKinds& kinds);

/// Reads the dirty ones among the playlists of `directory`, which is at `path`, from the index
/// `begin` to before `end`; parses them only where their files changed.
void readPlaylists(Directory& directory, const std::string& path, std::size_t begin,
                   std::size_t end);

/// Asks for the size and time of the songs of `directory`, which is at `path`, that are listed and
/// were not asked for yet.
void examineListedSongs(Directory& directory, const std::string& path);

} // namespace quorl::media
