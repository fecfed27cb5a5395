#include "services/media/Directory.h"

#include <algorithm>
#include <cerrno>
#include <cstdlib>
#include <ctime>
#include <iterator>
#include <system_error>
#include <utility>

#include <dirent.h>
#include <fcntl.h>
#include <sys/stat.h>

#include "services/base/FileContents.h"
#include "services/base/FileDescriptor.h"
#include "services/base/FileStatus.h"
#include "services/base/MallocText.h"
#include "services/base/Paths.h"
#include "services/base/Utf8.h"

namespace quorl::media {

namespace {

/// The coarsest clock among common file systems (FAT) ticks every two seconds.
constexpr std::int64_t quietTime = 2'000'000'000;

struct CloseDirectory {
    void operator()(DIR* stream) const { closedir(stream); }
};

using DirectoryStream = std::unique_ptr<DIR, CloseDirectory>;

PlaylistFile::State stateOf(const base::FileStatus& status) {
    return {status.st_ino, static_cast<std::uint64_t>(status.st_size),
            base::nanoseconds(status.st_mtim), base::nanoseconds(status.st_ctim)};
}

bool isQuiet(const PlaylistFile::State& state) {
    timespec now{};
    clock_gettime(CLOCK_REALTIME, &now);
    return std::max(state.modified, state.changed) < base::nanoseconds(now) - quietTime;
}

/// Everything in `file` up to one byte more than a playlist may have; null: it cannot be read.
std::optional<std::string> readBytes(int file) {
    try {
        return base::readAll(file, maximumPlaylistBytes + 1);
    } catch (const std::system_error&) {
        return std::nullopt;
    }
}

std::variant<PlaylistContent, Reason> readPlaylist(int file, const base::FileStatus& status,
                                                   Format format) {
    if (!S_ISREG(status.st_mode)) {
        return Reason::NotRegularFile;
    }
    if (static_cast<std::uint64_t>(status.st_size) > maximumPlaylistBytes) {
        return Reason::PlaylistTooLarge;
    }
    const auto bytes = readBytes(file);
    if (!bytes) {
        return Reason::PlaylistUnreadable;
    }
    if (bytes->size() > maximumPlaylistBytes) {
        return Reason::PlaylistTooLarge;
    }
    auto content = parsePlaylist(format, *bytes);
    if (!content) {
        return Reason::PlaylistBroken;
    }
    return *std::move(content);
}

/// Takes in the entries of one directory.
class DirectoryReader {
  public:
    DirectoryReader(Directory& directory, const std::string& path, const std::string& root,
                    ContentKinds& kinds)
        : directory_(directory),
          path_(path),
          root_(root),
          kinds_(kinds),
          previousPlaylists_(std::exchange(directory.playlists, {})) {}

    Dropped read() {
        clear();
        directory_.unreadable = !readEntries();
        if (directory_.unreadable) {
            clear();
        }
        order();
        return replaceChildren();
    }

  private:
    struct ListedChild {
        std::string name;
        ino_t inode;
    };

    void clear() {
        directory_.songNames = {};
        directory_.songs.clear();
        directory_.playlists.clear();
        directory_.hasLinks = false;
        listed_.clear();
    }

    /// False: the directory cannot be read. One that is gone is no failure, for its parent tells
    /// that.
    bool readEntries() {
        constexpr int flags = O_RDONLY | O_DIRECTORY | O_NOFOLLOW | O_CLOEXEC;
        base::FileDescriptor opened(open(path_.c_str(), flags));
        if (!opened) {
            return errno == ENOENT || errno == ENOTDIR || errno == ELOOP;
        }
        descriptor_ = opened.get();
        const DirectoryStream stream(fdopendir(opened.get()));
        if (!stream) {
            return false;
        }
        static_cast<void>(opened.release());
        for (;;) {
            errno = 0;
            // NOLINTNEXTLINE(concurrency-mt-unsafe): safe on a stream of its own
            const dirent* const entry = readdir(stream.get());
            if (entry == nullptr) {
                return errno == 0 || errno == ENOENT;
            }
            if (entry->d_name[0] != '.') {
                addEntry(*entry);
            }
        }
    }

    void addEntry(const dirent& entry) {
        switch (typeOf(entry)) {
        case DT_DIR:
            listed_.push_back({entry.d_name, entry.d_ino});
            break;
        case DT_REG:
            addRegularFile(entry.d_name);
            break;
        case DT_LNK:
            addLink(entry.d_name);
            break;
        case DT_UNKNOWN:
            break;
        default:
            if (playlistFormat(entry.d_name)) {
                addFailedPlaylist(entry.d_name, Reason::NotRegularFile);
            }
        }
    }

    /// `DT_UNKNOWN`: the entry is gone.
    [[nodiscard]] unsigned char typeOf(const dirent& entry) const {
        if (entry.d_type != DT_UNKNOWN) {
            return entry.d_type;
        }

        base::FileStatus status{};
        if (fstatat(descriptor_, entry.d_name, &status, AT_SYMLINK_NOFOLLOW) != 0) {
            return DT_UNKNOWN;
        }
        return static_cast<unsigned char>(IFTODT(status.st_mode));
    }

    void addRegularFile(const char* name) {
        if (const auto format = playlistFormat(name)) {
            addPlaylist(name, *format);
        } else if (const auto kind = kinds_.kindOf(descriptor_, name)) {
            SongFile song;
            song.name = directory_.songNames.add(name);
            song.kind = *kind;
            directory_.songs.push_back(song);
        }
    }

    /// A link to a regular file in the folder stands for that file.
    void addLink(const char* name) {
        const bool isPlaylist = playlistFormat(name).has_value();
        if (!isPlaylist && !kinds_.mayBeSong(name)) {
            return;
        }
        directory_.hasLinks = true;
        const auto obstacle = obstacleBehind(name);
        if (!obstacle) {
            addRegularFile(name);
        } else if (isPlaylist) {
            addFailedPlaylist(name, *obstacle);
        }
    }

    /// Why what the link leads to cannot stand in the folder; null: it can.
    [[nodiscard]] std::optional<Reason> obstacleBehind(const char* name) const {
        const base::MallocText target(realpath((path_ + '/' + name).c_str(), nullptr));

        base::FileStatus status{};
        if (!target || stat(target.get(), &status) != 0) {
            return errno == EACCES ? Reason::Unreachable : Reason::Missing;
        }
        if (!base::isWithin(target.get(), root_)) {
            return Reason::OutsideFolder;
        }
        return S_ISREG(status.st_mode) ? std::nullopt : std::optional(Reason::NotRegularFile);
    }

    void addFailedPlaylist(const char* name, Reason reason) {
        directory_.playlists.push_back({name, {}, false, reason});
    }

    void addPlaylist(const char* name, Format format) {

        base::FileStatus status{};
        if (PlaylistFile* const previous = previousPlaylist(name);
            previous != nullptr && previous->isQuiet &&
            fstatat(descriptor_, name, &status, 0) == 0 && stateOf(status) == previous->state) {
            directory_.playlists.push_back(
                {name, previous->state, true, std::move(previous->content)});
            return;
        }
        // Not blocking, for what was a file a moment ago may be a pipe by now.
        const base::FileDescriptor file(
            openat(descriptor_, name, O_RDONLY | O_NONBLOCK | O_NOCTTY | O_CLOEXEC));
        if (!file || fstat(file.get(), &status) != 0) {
            addFailedPlaylist(name, Reason::PlaylistUnreadable);
            return;
        }
        PlaylistFile playlist{name, stateOf(status), false, Reason::PlaylistUnreadable};
        const bool wasQuietBefore = isQuiet(playlist.state);
        playlist.content = readPlaylist(file.get(), status, format);
        playlist.isQuiet =
            wasQuietBefore && std::holds_alternative<PlaylistContent>(playlist.content);
        directory_.playlists.push_back(std::move(playlist));
    }

    /// What is known of the file from the last reading; null: nothing.
    PlaylistFile* previousPlaylist(std::string_view name) {
        const auto found =
            std::ranges::lower_bound(previousPlaylists_, name, {}, &PlaylistFile::name);
        return found != previousPlaylists_.end() && found->name == name ? &*found : nullptr;
    }

    void order() {
        const TextList& names = directory_.songNames;
        std::ranges::sort(directory_.songs, {},
                          [&names](const SongFile& song) { return names[song.name]; });
        std::ranges::sort(directory_.playlists, {}, &PlaylistFile::name);
        std::ranges::sort(listed_, {}, &ListedChild::name);
        directory_.songNames.shrink();
        directory_.songs.shrink_to_fit();
        directory_.playlists.shrink_to_fit();
    }

    /// Puts the listed children in place; gives those that are gone or replaced.
    Dropped replaceChildren() {
        Dropped dropped;
        std::vector<std::unique_ptr<Directory>> children;
        children.reserve(listed_.size());
        auto previous = directory_.children.begin();
        const auto end = directory_.children.end();
        for (ListedChild& child : listed_) {
            while (previous != end && (*previous)->name < child.name) {
                dropped.push_back(std::move(*previous++));
            }
            if (previous != end && (*previous)->name == child.name &&
                (*previous)->inode == child.inode) {
                children.push_back(std::move(*previous++));
            } else {
                children.push_back(std::make_unique<Directory>());
                children.back()->parent = &directory_;
                children.back()->name = std::move(child.name);
                children.back()->inode = child.inode;
            }
        }
        std::move(previous, end, std::back_inserter(dropped));
        directory_.children = std::move(children);
        return dropped;
    }

    Directory& directory_;
    const std::string& path_;
    const std::string& root_;
    ContentKinds& kinds_;
    int descriptor_ = -1;
    std::vector<PlaylistFile> previousPlaylists_;
    std::vector<ListedChild> listed_;
};

void examine(int directory, const char* name, SongFile& song) {
    base::FileStatus status{};
    song.examined = true;
    song.obstacle.reset();
    if (fstatat(directory, name, &status, 0) != 0) {
        song.obstacle = errno == EACCES ? Reason::Unreachable : Reason::Missing;
    } else if (!S_ISREG(status.st_mode)) {
        song.obstacle = Reason::NotRegularFile;
    } else {
        song.size = static_cast<std::uint64_t>(status.st_size);
        song.modified = base::nanoseconds(status.st_mtim);
    }
}

} // namespace

Directory* Directory::child(std::string_view childName) const {
    const auto nameOf = [](const auto& candidate) -> std::string_view { return candidate->name; };
    const auto found = std::ranges::lower_bound(children, childName, {}, nameOf);
    return found != children.end() && (*found)->name == childName ? found->get() : nullptr;
}

SongFile* Directory::song(std::string_view songName) {
    const auto nameOf = [this](const SongFile& candidate) { return songNames[candidate.name]; };
    const auto found = std::ranges::lower_bound(songs, songName, {}, nameOf);
    return found != songs.end() && nameOf(*found) == songName ? &*found : nullptr;
}

std::string Directory::path() const {
    return parent == nullptr ? std::string() : parent->pathOf(name);
}

std::string Directory::pathOf(std::string_view entry) const {
    std::string result = path();
    if (!result.empty()) {
        result += '/';
    }
    return result.append(entry);
}

Dropped readDirectory(Directory& directory, const std::string& path, const std::string& root,
                      ContentKinds& kinds) {
    return DirectoryReader(directory, path, root, kinds).read();
}

void examineListedSongs(Directory& directory, const std::string& path) {
    const auto isWanted = [](const SongFile& song) { return song.listed && !song.examined; };
    auto song = std::ranges::find_if(directory.songs, isWanted);
    if (song == directory.songs.end()) {
        return;
    }
    const base::FileDescriptor opened(
        open(path.c_str(), O_PATH | O_DIRECTORY | O_NOFOLLOW | O_CLOEXEC));
    for (; song != directory.songs.end();
         song = std::find_if(++song, directory.songs.end(), isWanted)) {
        examine(opened.get(), std::string(directory.songNames[song->name]).c_str(), *song);
    }
}

} // namespace quorl::media
