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
#include "services/media/playlists/PlaylistContent.h"
#include "services/media/playlists/TextList.h"

namespace quorl::media {

/// A file that may be listed as a song. Its size and time are asked for only once a playlist lists
/// it.
struct SongFile {
    static constexpr SongIndex notListed = std::numeric_limits<SongIndex>::max();

    std::uint64_t size = 0;
    std::int64_t modified = 0;
    /// Index in `Directory::songNames`.
    std::uint32_t name = 0;
    /// Where it is in the inventory that is being built.
    SongIndex song = notListed;
    Kind kind = Kind::Audio;
    /// A playlist lists it.
    bool listed = false;
    /// Whether `size` and `modified`, or `obstacle`, are known.
    bool examined = false;
    /// Why it cannot be listed after all; null: it can.
    std::optional<Reason> obstacle;
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
    State state;
    /// The file had not just been written when it was read. While it has, a further write may leave
    /// the state as it is, for clocks of file systems tick slowly.
    bool isQuiet = false;
    /// A reason stands for a file that could not be read.
    std::variant<PlaylistContent, Reason> content = Reason::PlaylistUnreadable;
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
    /// The directory itself could not be read; it is empty then.
    bool unreadable = false;
    /// There are symbolic links to files.
    bool hasLinks = false;

    TextList songNames;
    /// By name, as the next two are.
    std::vector<SongFile> songs;
    std::vector<PlaylistFile> playlists;
    std::vector<std::unique_ptr<Directory>> children;

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

/// Reads `directory` again, which is at `path` in the folder at `root`, both without symbolic
/// links.
///
/// Children that are still there are kept as they are, new ones are added as dirty and unread, and
/// those that are gone are given back. Playlists are parsed again only where their files changed. A
/// directory that cannot be read ends up empty. Never blocks on a pipe or a device.
[[nodiscard]] Dropped readDirectory(Directory& directory, const std::string& path,
                                    const std::string& root, ContentKinds& kinds);

/// Asks for the size and time of the songs of `directory`, which is at `path`, that are listed and
/// were not asked for yet.
void examineListedSongs(Directory& directory, const std::string& path);

} // namespace quorl::media
