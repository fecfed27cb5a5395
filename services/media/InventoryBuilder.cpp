#include "services/media/InventoryBuilder.h"

#include <algorithm>
#include <unordered_map>
#include <unordered_set>
#include <utility>
#include <variant>

#include "services/base/Utf8.h"
#include "services/media/Collation.h"
#include "services/media/EntryResolver.h"
#include "services/media/PlaylistIdentity.h"

namespace quorl::media {

namespace {

/// A longer name is none, but somebody's attempt to choke whoever shows it.
constexpr std::size_t longestName = 4096;

/// A playlist on its way into the inventory.
struct Draft {
    Playlist playlist;
    /// Where the file lies; for a folder, the folder itself.
    Directory* directory;
    /// Null for a folder.
    const PlaylistContent* content;
    Format format;
    /// What the entries of the file mean, in their order.
    std::vector<Resolved> resolved;
};

std::string fileNameWithoutExtension(std::string_view fileName) {
    const std::size_t dot = fileName.rfind('.');
    return base::validUtf8(dot == 0 ? fileName : fileName.substr(0, dot));
}

class InventoryBuilder {
  public:
    InventoryBuilder(FolderTree& tree, const std::stop_token& stop) : tree_(tree), stop_(stop) {}

    std::shared_ptr<const Inventory> build() {
        snapshot_->root = tree_.root();
        snapshot_->rootFound = tree_.top() != nullptr;
        snapshot_->unwatchedDirectories = tree_.unwatchedDirectories();
        if (tree_.top() != nullptr) {
            collect();
            order();
            leaveOutDoubles();
            resolveEntries();
            examineSongs();
            listSongs();
            fillFolders();
            finish();
        }
        return stop_.stop_requested() ? nullptr : std::move(snapshot_);
    }

  private:
    void collect() {
        for (Directory* const directory : tree_.directories()) {
            if (directory->unreadable) {
                leaveOut(directory->path(), {}, Reason::DirectoryUnreadable);
            }
            for (SongFile& song : directory->songs) {
                song.song = SongFile::notListed;
                song.listed = false;
                (song.kind == Kind::Audio ? snapshot_->hasAudio : snapshot_->hasMusicVideo) = true;
            }
            collectPlaylists(*directory);
        }
    }

    void collectPlaylists(Directory& directory) {
        bool any = false;
        for (const PlaylistFile& file : directory.playlists) {
            std::string path = directory.pathOf(file.name);
            if (const Reason* const reason = std::get_if<Reason>(&file.content)) {
                leaveOut(std::move(path), {}, *reason);
                continue;
            }
            const auto& content = std::get<PlaylistContent>(file.content);
            Playlist playlist;
            playlist.name = content.name.empty() || content.name.size() > longestName
                                ? fileNameWithoutExtension(file.name)
                                : content.name;
            playlist.path = std::move(path);
            playlist.generated = content.generated;
            drafts_.push_back(
                {std::move(playlist), &directory, &content, *playlistFormat(file.name), {}});
            any = true;
        }
        if (any && directory.parent != nullptr) {
            Playlist folder;
            folder.name = base::validUtf8(directory.name);
            folder.path = directory.path();
            folder.folder = true;
            drafts_.push_back({std::move(folder), &directory, nullptr, Format::M3u, {}});
        }
    }

    void order() {
        const Collation collation;
        std::ranges::sort(drafts_, [&collation](const Draft& left, const Draft& right) {
            const int order = collation.compare(left.playlist.name, right.playlist.name);
            return order != 0 ? order < 0 : left.playlist.path < right.playlist.path;
        });
    }

    void leaveOutDoubles() {
        std::unordered_set<std::uint64_t> ids;
        std::erase_if(drafts_, [&](Draft& draft) {
            draft.playlist.id = playlistId(draft.playlist.path, draft.playlist.folder);
            if (ids.insert(draft.playlist.id).second) {
                return false;
            }
            leaveOut(draft.playlist.path, {}, Reason::SameAsAnother);
            return true;
        });
    }

    /// Finds what every entry means before any file is asked for its size, so that those of one
    /// directory can be asked together.
    void resolveEntries() {
        const EntryResolver resolver(tree_);
        for (Draft& draft : drafts_) {
            const std::uint32_t count =
                draft.content == nullptr ? 0 : draft.content->entries.size();
            draft.resolved.reserve(count);
            for (std::uint32_t index = 0; index < count && !stop_.stop_requested(); ++index) {
                draft.resolved.push_back(resolver.resolve(
                    *draft.directory, draft.content->entries[index], draft.format));
                if (auto* const found = std::get_if<FoundSong>(&draft.resolved.back())) {
                    found->file->listed = true;
                }
            }
        }
    }

    void examineSongs() {
        for (Directory* const directory : tree_.directories()) {
            if (!stop_.stop_requested()) {
                examineListedSongs(*directory, tree_.absolute(directory->path()));
            }
        }
    }

    void listSongs() {
        for (Draft& draft : drafts_) {
            Playlist& playlist = draft.playlist;
            for (std::uint32_t index = 0; index < draft.resolved.size(); ++index) {
                if (const auto song = songOf(draft.resolved[index])) {
                    playlist.songs.push_back(*song);
                } else {
                    leaveOut(playlist.path, std::string(draft.content->entries[index]),
                             reasonOf(draft.resolved[index]));
                }
            }
            draft.resolved = {};
            if (draft.content != nullptr && draft.content->truncated) {
                leaveOut(playlist.path, {}, Reason::TooManyEntries);
            }
        }
    }

    /// Null: the entry is left out.
    std::optional<SongIndex> songOf(const Resolved& resolved) {
        const FoundSong* const found = std::get_if<FoundSong>(&resolved);
        if (found == nullptr || found->file->obstacle) {
            return std::nullopt;
        }
        SongFile& file = *found->file;
        if (file.song == SongFile::notListed) {
            const std::string_view name = found->directory->songNames[file.name];
            file.song = snapshot_->songs.add(indexOf(*found->directory),
                                             {{}, name, file.size, file.modified, file.kind});
            fingerprints_.push_back(fingerprint(snapshot_->songs[file.song]));
        }
        return file.song;
    }

    static Reason reasonOf(const Resolved& resolved) {
        const FoundSong* const found = std::get_if<FoundSong>(&resolved);
        return found == nullptr ? std::get<Reason>(resolved) : *found->file->obstacle;
    }

    std::uint32_t indexOf(const Directory& directory) {
        const auto [place, isNew] = directories_.try_emplace(&directory, 0);
        if (isNew) {
            place->second = snapshot_->songs.addDirectory(directory.path());
        }
        return place->second;
    }

    void fillFolders() {
        std::unordered_map<const Directory*, std::vector<SongIndex>*> folders;
        for (Draft& draft : drafts_) {
            if (draft.content == nullptr) {
                folders.emplace(draft.directory, &draft.playlist.songs);
            }
        }
        for (const Draft& draft : drafts_) {
            const auto folder = folders.find(draft.directory);
            if (draft.content != nullptr && folder != folders.end()) {
                folder->second->insert(folder->second->end(), draft.playlist.songs.begin(),
                                       draft.playlist.songs.end());
            }
        }
    }

    void finish() {
        snapshot_->playlists.reserve(drafts_.size());
        for (Draft& draft : drafts_) {
            Fingerprint revision;
            for (const SongIndex song : draft.playlist.songs) {
                revision.add(fingerprints_[song]);
            }
            draft.playlist.revision = revision.value();
            draft.playlist.songs.shrink_to_fit();
            snapshot_->playlists.push_back(std::move(draft.playlist));
        }
        snapshot_->songs.shrink();
        std::ranges::stable_sort(snapshot_->leftOut, {}, &LeftOut::playlist);
        snapshot_->leftOut.shrink_to_fit();
    }

    void leaveOut(std::string playlist, std::string entry, Reason reason) {
        snapshot_->leftOut.push_back({std::move(playlist), std::move(entry), reason});
    }

    FolderTree& tree_;
    const std::stop_token& stop_;
    std::shared_ptr<Inventory> snapshot_ = std::make_shared<Inventory>();
    std::vector<Draft> drafts_;
    std::unordered_map<const Directory*, std::uint32_t> directories_;
    /// Of the songs of the inventory, in their order.
    std::vector<std::uint64_t> fingerprints_;
};

} // namespace

std::shared_ptr<const Inventory> buildInventory(FolderTree& tree, const std::stop_token& stop) {
    return InventoryBuilder(tree, stop).build();
}

} // namespace quorl::media
