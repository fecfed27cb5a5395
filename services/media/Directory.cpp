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
#include "services/media/PlaylistIdentity.h"

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
        : directory_(directory), path_(path), root_(root), kinds_(kinds) {}

    Reading read() {
        Reading reading;
        const bool wasUnreadable = std::exchange(directory_.unreadable, !readEntries());
        if (directory_.unreadable) {
            clear();
        }
        order();
        reading.otherPlaylists = directory_.unreadable != wasUnreadable || !playlists_.empty() ||
                                 !directory_.playlists.empty();
        replacePlaylists();
        const bool otherSongs = replaceSongs();
        reading.otherNames = replaceChildren(reading.dropped) || otherSongs;
        return reading;
    }

  private:
    struct ListedSong {
        /// Index in `names_`.
        std::uint32_t name;
        Kind kind;
    };

    struct ListedChild {
        std::string name;
        ino_t inode;
    };

    void clear() {
        names_ = {};
        songs_.clear();
        playlists_.clear();
        children_.clear();
    }

    /// False: the directory cannot be read. One that is gone is no failure, for its parent tells
    /// that.
    bool readEntries() {
        directory_.hasLinks = false;
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
            children_.push_back({entry.d_name, entry.d_ino});
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
            PlaylistFile playlist;
            playlist.name = name;
            playlist.format = *format;
            playlists_.push_back(std::move(playlist));
        } else if (const auto kind = kinds_.kindOf(descriptor_, name)) {
            songs_.push_back({names_.add(name), *kind});
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
        PlaylistFile playlist;
        playlist.name = name;
        playlist.format = *playlistFormat(name);
        playlist.content = reason;
        playlist.dirty = false;
        playlists_.push_back(std::move(playlist));
    }

    void order() {
        std::ranges::sort(songs_, {}, [this](const ListedSong& song) { return names_[song.name]; });
        std::ranges::sort(playlists_, {}, &PlaylistFile::name);
        std::ranges::sort(children_, {}, &ListedChild::name);
    }

    /// What was read from the files before is kept until they are looked at.
    void replacePlaylists() {
        auto previous = directory_.playlists.begin();
        const auto end = directory_.playlists.end();
        for (PlaylistFile& playlist : playlists_) {
            previous = std::find_if(previous, end, [&playlist](const PlaylistFile& each) {
                return each.name >= playlist.name;
            });
            if (playlist.dirty && previous != end && previous->name == playlist.name) {
                playlist = std::move(*previous++);
                playlist.dirty = true;
            }
        }
        directory_.playlists = std::move(playlists_);
        directory_.playlists.shrink_to_fit();
    }

    /// False: they are the same songs in the same places, which are to be asked again.
    bool replaceSongs() {
        if (areSongsAsBefore()) {
            for (SongFile& song : directory_.songs) {
                song.examined = false;
            }
            return false;
        }
        TextList names;
        std::vector<SongFile> songs(songs_.size());
        for (std::size_t index = 0; index < songs.size(); ++index) {
            names.add(names_[songs_[index].name]);
            songs[index].kind = songs_[index].kind;
        }
        directory_.songs = std::move(songs);
        directory_.songNames = NameTable(std::move(names));
        directory_.reshaped = true;
        return true;
    }

    [[nodiscard]] bool areSongsAsBefore() const {
        std::uint32_t index = 0;
        return songs_.size() == directory_.songs.size() &&
               std::ranges::all_of(songs_, [&](const ListedSong& song) {
                   const std::uint32_t at = index++;
                   return song.kind == directory_.songs[at].kind &&
                          names_[song.name] == directory_.songNames[at];
               });
    }

    /// Puts the listed children in place, and those that are gone or replaced into `dropped`.
    /// False: they are all the same.
    bool replaceChildren(Dropped& dropped) {
        bool anyNew = false;
        std::vector<std::unique_ptr<Directory>> children;
        children.reserve(children_.size());
        auto previous = directory_.children.begin();
        const auto end = directory_.children.end();
        for (ListedChild& child : children_) {
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
                anyNew = true;
            }
        }
        std::move(previous, end, std::back_inserter(dropped));
        directory_.children = std::move(children);
        const bool areOthers = anyNew || !dropped.empty();
        if (areOthers) {
            TextList names;
            for (const auto& child : directory_.children) {
                names.add(child->name);
            }
            directory_.childNames = NameTable(std::move(names));
        }
        return areOthers;
    }

    Directory& directory_;
    const std::string& path_;
    const std::string& root_;
    ContentKinds& kinds_;
    int descriptor_ = -1;
    TextList names_;
    std::vector<ListedSong> songs_;
    std::vector<PlaylistFile> playlists_;
    std::vector<ListedChild> children_;
};

/// Looks at the file in the open `directory`, and reads it where that is not what was read before.
void refresh(PlaylistFile& playlist, int directory) {
    playlist.dirty = false;
    base::FileStatus status{};
    if (playlist.isQuiet && fstatat(directory, playlist.name.c_str(), &status, 0) == 0 &&
        stateOf(status) == playlist.state) {
        return;
    }
    playlist.isQuiet = false;
    playlist.content = Reason::PlaylistUnreadable;
    playlist.title.reset();
    playlist.meaning = {};
    // Not blocking, for what was a file a moment ago may be a pipe by now.
    const base::FileDescriptor file(
        openat(directory, playlist.name.c_str(), O_RDONLY | O_NONBLOCK | O_NOCTTY | O_CLOEXEC));
    if (!file || fstat(file.get(), &status) != 0) {
        return;
    }
    playlist.state = stateOf(status);
    const bool wasQuietBefore = isQuiet(playlist.state);
    playlist.content = readPlaylist(file.get(), status, playlist.format);
    playlist.isQuiet = wasQuietBefore && std::holds_alternative<PlaylistContent>(playlist.content);
}

base::FileDescriptor openToLookAt(const std::string& path) {
    return base::FileDescriptor(open(path.c_str(), O_PATH | O_DIRECTORY | O_NOFOLLOW | O_CLOEXEC));
}

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
    const auto found = childNames.find(childName);
    return found ? children[*found].get() : nullptr;
}

SongFile* Directory::song(std::string_view songName) {
    const auto found = songNames.find(songName);
    return found ? &songs[*found] : nullptr;
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

Reading readDirectory(Directory& directory, const std::string& path, const std::string& root,
                      ContentKinds& kinds) {
    return DirectoryReader(directory, path, root, kinds).read();
}

void readPlaylists(Directory& directory, const std::string& path, std::size_t begin,
                   std::size_t end) {
    const base::FileDescriptor opened = openToLookAt(path);
    for (std::size_t index = begin; index < end; ++index) {
        if (directory.playlists[index].dirty) {
            refresh(directory.playlists[index], opened.get());
        }
    }
}

void examineListedSongs(Directory& directory, const std::string& path) {
    const auto isWanted = [](const SongFile& song) { return song.listed && !song.examined; };
    if (std::ranges::none_of(directory.songs, isWanted)) {
        return;
    }
    const base::FileDescriptor opened = openToLookAt(path);
    const Fingerprint common = fingerprintOf(directory.path());
    std::string name;
    for (std::uint32_t index = 0; index < directory.songs.size(); ++index) {
        SongFile& song = directory.songs[index];
        if (isWanted(song)) {
            name = directory.songNames[index];
            examine(opened.get(), name.c_str(), song);
            song.fingerprint = fingerprint(common, {{}, name, song.size, song.modified, song.kind});
        }
    }
}

} // namespace quorl::media
