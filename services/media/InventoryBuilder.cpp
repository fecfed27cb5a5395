#include "services/media/InventoryBuilder.h"

#include <algorithm>
#include <atomic>
#include <tuple>
#include <unordered_map>
#include <unordered_set>
#include <utility>
#include <variant>

#include "services/base/Utf8.h"
#include "services/media/EntryResolver.h"
#include "services/media/PlaylistIdentity.h"
#include "services/media/Workers.h"

namespace quorl::media {

namespace {

/// A longer name is none, but somebody's attempt to choke whoever shows it.
constexpr std::size_t longestName = 4096;

std::string fileNameWithoutExtension(std::string_view fileName) {
    const std::size_t dot = fileName.rfind('.');
    return base::validUtf8(dot == 0 ? fileName : fileName.substr(0, dot));
}

const PlaylistContent& contentOf(const PlaylistFile& file) {
    return std::get<PlaylistContent>(file.content);
}

std::string nameOf(const PlaylistFile& file) {
    const std::string& name = contentOf(file).name;
    return name.empty() || name.size() > longestName ? fileNameWithoutExtension(file.name) : name;
}

Title makeTitle(std::string path, std::string name, bool folder, const Collation& collation) {
    const std::uint64_t id = playlistId(path, folder);
    std::string order = collation.key(name);
    return {id, std::move(path), std::move(name), std::move(order)};
}

/// Several workers may find the same song.
void markListed(SongFile& song) {
    std::atomic_ref(song.listed).store(true, std::memory_order_relaxed);
}

/// Finds out what the entries of one playlist file mean.
class MeaningFinder {
  public:
    MeaningFinder(const EntryResolver& resolver, Directory& directory, PlaylistFile& file)
        : resolver_(resolver),
          directory_(directory),
          format_(file.format),
          entries_(contentOf(file).entries),
          meaning_(file.meaning) {}

    void findAll(const std::stop_token& stop) {
        meaning_ = {};
        meaning_.entries.reserve(entries_.size());
        for (std::uint32_t index = 0; index < entries_.size(); ++index) {
            if (stop.stop_requested()) {
                return;
            }
            const Resolution resolution = resolver_.resolve(directory_, entries_[index], format_);
            meaning_.entries.push_back(noted(resolution.meaning));
            meaning_.hangsOnNames = meaning_.hangsOnNames || resolution.basis == Basis::Names;
            if (resolution.basis == Basis::Files) {
                meaning_.asked.push_back(index);
            }
        }
        meaning_.holders.shrink_to_fit();
        meaning_.known = true;
    }

    void askAgain(const std::stop_token& stop) {
        const auto isAsBefore = [&](std::uint32_t index) {
            return stop.stop_requested() ||
                   isSame(meaning_.entries[index],
                          resolver_.resolve(directory_, entries_[index], format_).meaning);
        };
        if (!std::ranges::all_of(meaning_.asked, isAsBefore)) {
            findAll(stop);
        }
    }

  private:
    [[nodiscard]] bool isSame(const Meaning::Entry& entry, const Resolved& resolved) const {
        const auto* const before = std::get_if<Meaning::Found>(&entry);
        const auto* const now = std::get_if<FoundSong>(&resolved);
        if (before == nullptr || now == nullptr) {
            return before == nullptr && now == nullptr &&
                   std::get<Reason>(entry) == std::get<Reason>(resolved);
        }
        Directory* const holder = meaning_.holders[before->holder];
        return holder == now->directory && &holder->songs[before->song] == now->file;
    }

    Meaning::Entry noted(const Resolved& resolved) {
        const auto* const found = std::get_if<FoundSong>(&resolved);
        if (found == nullptr) {
            return std::get<Reason>(resolved);
        }
        markListed(*found->file);
        if (meaning_.holders.empty() || meaning_.holders.back() != found->directory) {
            meaning_.holders.push_back(found->directory);
        }
        return Meaning::Found{
            static_cast<std::uint32_t>(meaning_.holders.size() - 1),
            static_cast<std::uint32_t>(found->file - found->directory->songs.data())};
    }

    const EntryResolver& resolver_;
    Directory& directory_;
    const Format format_;
    const TextList& entries_;
    Meaning& meaning_;
};

/// Puts the songs of playlists into an inventory.
class SongLister {
  public:
    explicit SongLister(Inventory& inventory) : inventory_(inventory) {}

    /// The songs must not be listed by another one as long as this is there.
    ~SongLister() {
        for (SongFile* const file : files_) {
            file->song = SongFile::notListed;
        }
    }

    SongLister(const SongLister&) = delete;
    SongLister& operator=(const SongLister&) = delete;

    void list(Playlist& playlist, const PlaylistFile& file) {
        const PlaylistContent& content = contentOf(file);
        const Meaning& meaning = file.meaning;
        playlist.songs.reserve(meaning.entries.size());
        for (std::uint32_t index = 0; index < meaning.entries.size(); ++index) {
            const Meaning::Entry& entry = meaning.entries[index];
            const auto* const found = std::get_if<Meaning::Found>(&entry);
            const auto obstacle = found == nullptr
                                      ? std::optional(std::get<Reason>(entry))
                                      : add(*meaning.holders[found->holder], found->song, playlist);
            if (obstacle) {
                leaveOut(playlist.path, std::string(content.entries[index]), *obstacle);
            }
        }
        playlist.songs.shrink_to_fit();
        playlist.revision = revisionOf(playlist.songs);
        if (content.truncated) {
            leaveOut(playlist.path, {}, Reason::TooManyEntries);
        }
    }

    [[nodiscard]] std::uint64_t revisionOf(const std::vector<SongIndex>& songs) const {
        Fingerprint revision;
        for (const SongIndex song : songs) {
            revision.add(files_[song]->fingerprint);
        }
        return revision.value();
    }

  private:
    /// Gives back why it cannot be listed; null: it was.
    std::optional<Reason> add(Directory& directory, std::uint32_t song, Playlist& playlist) {
        SongFile& file = directory.songs[song];
        if (file.obstacle) {
            return file.obstacle;
        }
        if (file.song == SongFile::notListed) {
            file.song = inventory_.songs.add(
                indexOf(directory),
                {{}, directory.songNames[song], file.size, file.modified, file.kind});
            files_.push_back(&file);
        }
        playlist.songs.push_back(file.song);
        return std::nullopt;
    }

    std::uint32_t indexOf(const Directory& directory) {
        const auto [place, isNew] = directories_.try_emplace(&directory, 0);
        if (isNew) {
            place->second = inventory_.songs.addDirectory(directory.path());
        }
        return place->second;
    }

    void leaveOut(std::string playlist, std::string entry, Reason reason) {
        inventory_.leftOut.push_back({std::move(playlist), std::move(entry), reason});
    }

    Inventory& inventory_;
    /// In the order of the songs of the inventory.
    std::vector<SongFile*> files_;
    std::unordered_map<const Directory*, std::uint32_t> directories_;
};

} // namespace

std::shared_ptr<const Inventory> InventoryBuilder::build(const std::stop_token& stop) {
    const FolderTree::News& news = tree_.news();
    if (isFirst_ || news.otherNames || news.otherPlaylists) {
        collect();
    }
    if (tree_.top() != nullptr) {
        findMeanings(stop);
        examineSongs(stop);
    }
    if (stop.stop_requested()) {
        return nullptr;
    }
    isFirst_ = false;
    auto inventory = takeInventory();
    tree_.forgetNews();
    return inventory;
}

void InventoryBuilder::collect() {
    listed_.clear();
    leftOut_.clear();
    hasAudio_ = hasMusicVideo_ = false;
    for (Directory* const directory : tree_.directories()) {
        if (directory->unreadable) {
            leftOut_.push_back({directory->path(), {}, Reason::DirectoryUnreadable});
        }
        for (const SongFile& song : directory->songs) {
            (song.kind == Kind::Audio ? hasAudio_ : hasMusicVideo_) = true;
        }
        collectPlaylists(*directory);
    }
    std::ranges::sort(listed_, {}, [](const Listed& each) {
        return std::tie(each.title->order, each.title->path);
    });
    leaveOutDoubles();
}

void InventoryBuilder::collectPlaylists(Directory& directory) {
    bool any = false;
    for (PlaylistFile& file : directory.playlists) {
        if (const Reason* const reason = std::get_if<Reason>(&file.content)) {
            leftOut_.push_back({directory.pathOf(file.name), {}, *reason});
            continue;
        }
        if (!file.title) {
            file.title = makeTitle(directory.pathOf(file.name), nameOf(file), false, collation_);
        }
        listed_.push_back({&directory, &file, &*file.title});
        any = true;
    }
    if (any && directory.parent != nullptr) {
        if (!directory.title) {
            directory.title =
                makeTitle(directory.path(), base::validUtf8(directory.name), true, collation_);
        }
        listed_.push_back({&directory, nullptr, &*directory.title});
    }
}

void InventoryBuilder::leaveOutDoubles() {
    std::unordered_set<std::uint64_t> ids;
    std::erase_if(listed_, [&](const Listed& each) {
        if (ids.insert(each.title->id).second) {
            return false;
        }
        leftOut_.push_back({each.title->path, {}, Reason::SameAsAnother});
        if (each.file != nullptr) {
            each.file->meaning = {}; // nobody looks after it from here on
        }
        return true;
    });
}

/// Before any file is asked for its size, so that those of one directory can be asked together.
void InventoryBuilder::findMeanings(const std::stop_token& stop) {
    std::vector<const Listed*> open;
    for (const Listed& each : listed_) {
        if (each.file != nullptr &&
            (mayMeanOtherwise(each.file->meaning) || !each.file->meaning.asked.empty())) {
            open.push_back(&each);
        }
    }
    const EntryResolver resolver(tree_);
    shareOut(open.size(), [&](std::size_t index, std::size_t) {
        const Listed& each = *open[index];
        MeaningFinder finder(resolver, *each.directory, *each.file);
        if (mayMeanOtherwise(each.file->meaning)) {
            finder.findAll(stop);
        } else {
            finder.askAgain(stop);
        }
    });
    for (const Listed* const each : open) {
        for (Directory* const holder : each->file->meaning.holders) {
            tree_.note(*holder);
        }
    }
}

bool InventoryBuilder::mayMeanOtherwise(const Meaning& meaning) const {
    const auto isOther = [](const Directory* holder) { return holder->reshaped; };
    return !meaning.known ||
           (tree_.news().otherNames && (meaning.hangsOnNames || !meaning.asked.empty() ||
                                        std::ranges::any_of(meaning.holders, isOther)));
}

void InventoryBuilder::examineSongs(const std::stop_token& stop) {
    const auto& touched = tree_.news().touched;
    shareOut(touched.size(), [&](std::size_t index, std::size_t) {
        if (!touched[index]->gone && !stop.stop_requested()) {
            examineListedSongs(*touched[index], tree_.absolute(touched[index]->path()));
        }
    });
}

std::shared_ptr<const Inventory> InventoryBuilder::takeInventory() const {
    const auto inventory = std::make_shared<Inventory>();
    inventory->root = tree_.root();
    inventory->rootFound = tree_.top() != nullptr;
    inventory->unwatchedDirectories = tree_.unwatchedDirectories();
    inventory->hasAudio = hasAudio_;
    inventory->hasMusicVideo = hasMusicVideo_;
    inventory->leftOut = leftOut_;
    SongLister lister(*inventory);
    std::unordered_map<const Directory*, std::vector<SongIndex>> folders;
    for (const Listed& each : listed_) {
        if (each.file == nullptr) {
            folders.try_emplace(each.directory);
        }
    }
    inventory->playlists.reserve(listed_.size());
    for (const Listed& each : listed_) {
        Playlist& playlist = inventory->playlists.emplace_back();
        playlist.id = each.title->id;
        playlist.name = each.title->name;
        playlist.path = each.title->path;
        playlist.folder = each.file == nullptr;
        if (each.file == nullptr) {
            continue;
        }
        playlist.generated = contentOf(*each.file).generated;
        lister.list(playlist, *each.file);
        if (const auto folder = folders.find(each.directory); folder != folders.end()) {
            folder->second.insert(folder->second.end(), playlist.songs.begin(),
                                  playlist.songs.end());
        }
    }
    for (std::size_t index = 0; index < listed_.size(); ++index) {
        if (listed_[index].file == nullptr) {
            Playlist& folder = inventory->playlists[index];
            folder.songs = std::move(folders[listed_[index].directory]);
            folder.songs.shrink_to_fit();
            folder.revision = lister.revisionOf(folder.songs);
        }
    }
    inventory->songs.shrink();
    std::ranges::stable_sort(inventory->leftOut, {}, &LeftOut::playlist);
    inventory->leftOut.shrink_to_fit();
    return inventory;
}

} // namespace quorl::media
