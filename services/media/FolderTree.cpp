#include "services/media/FolderTree.h"

#include <algorithm>
#include <iterator>
#include <optional>
#include <system_error>
#include <utility>

#include "services/media/Workers.h"

namespace quorl::media {

namespace {

/// Calls `use` with `top` and each directory below it, a directory before those in it. `use` may
/// change the children of the directory that it is given.
template <class Use>
void forEachDirectory(Directory& top, Use use) {
    std::vector<Directory*> waiting{&top};
    while (!waiting.empty()) {
        Directory& directory = *waiting.back();
        waiting.pop_back();
        use(directory);
        const auto& children = directory.children;
        std::for_each(children.rbegin(), children.rend(),
                      [&waiting](const auto& child) { waiting.push_back(child.get()); });
    }
}

/// Links lead to what is not watched with them, and a directory that cannot be read cannot be
/// watched.
bool isUncertain(const Directory& directory) { return directory.hasLinks || directory.unreadable; }

/// Has a refresh come by.
void makePending(Directory& directory) {
    for (Directory* at = &directory; at != nullptr && !at->pending; at = at->parent) {
        at->pending = true;
    }
}

std::vector<Directory*> pendingIn(const std::vector<Directory*>& directories) {
    std::vector<Directory*> result;
    for (const Directory* const directory : directories) {
        for (const auto& child : directory->children) {
            if (child->pending) {
                result.push_back(child.get());
            }
        }
    }
    return result;
}

} // namespace

FolderTree::FolderTree(std::filesystem::path root, base::DirectoryWatch* watch)
    : root_(std::move(root)), watch_(watch), kinds_(workerCount()) {}

void FolderTree::reset() {
    if (top_) {
        drop(std::move(top_));
        news_.otherNames = news_.otherPlaylists = true;
    }
    dirty_ = true;
}

void FolderTree::markAll() {
    if (top_) {
        forEachDirectory(*top_,
                         [](Directory& directory) { directory.dirty = directory.pending = true; });
    }
    dirty_ = true;
}

void FolderTree::mark(const base::DirectoryWatch::Changes& changes) {
    if (changes.lost) {
        markAll();
    }
    for (const int watch : changes.changed) {
        if (const auto found = watched_.find(watch); found != watched_.end()) {
            found->second->dirty = dirty_ = true;
            makePending(*found->second);
        }
    }
}

bool FolderTree::refresh(const std::stop_token& stop) {
    if (!top_) {
        findTop();
    }
    Directories visited;
    Directories level;
    if (top_ && top_->pending) {
        level.push_back(top_.get());
    }
    // Level by level, for which directories there are is known only once those above were read.
    while (!level.empty()) {
        read(level, stop);
        visited.insert(visited.end(), level.begin(), level.end());
        level = pendingIn(level);
    }
    readPlaylists(stop);
    if (stop.stop_requested()) {
        return false;
    }
    settle(visited);
    dirty_ = false;
    return true;
}

void FolderTree::note(Directory& directory) {
    if (!std::exchange(directory.noted, true)) {
        news_.touched.push_back(&directory);
    }
}

void FolderTree::forgetNews() {
    for (Directory* const directory : news_.touched) {
        directory->reshaped = directory->noted = false;
    }
    news_ = {};
    dropped_.clear();
}

std::vector<Directory*> FolderTree::directories() const {
    std::vector<Directory*> result;
    if (top_) {
        forEachDirectory(*top_, [&result](Directory& directory) { result.push_back(&directory); });
    }
    return result;
}

std::size_t FolderTree::unwatchedDirectories() const {
    std::size_t count = 0;
    if (watch_ != nullptr && top_) {
        forEachDirectory(*top_, [&count](const Directory& directory) {
            count += !directory.watch && !directory.unreadable ? 1 : 0;
        });
    }
    return count;
}

std::string FolderTree::absolute(const std::string& path) const {
    if (path.empty()) {
        return canonicalRoot_.empty() ? "/" : canonicalRoot_;
    }
    return canonicalRoot_ + '/' + path;
}

void FolderTree::findTop() {
    std::error_code error;
    const std::filesystem::path canonical = std::filesystem::canonical(root_, error);
    if (error || !std::filesystem::is_directory(canonical, error)) {
        return;
    }
    canonicalRoot_ = canonical == "/" ? std::string() : canonical.string();
    top_ = std::make_unique<Directory>();
}

void FolderTree::read(const Directories& visited, const std::stop_token& stop) {
    Directories wanted;
    std::ranges::copy_if(visited, std::back_inserter(wanted), [](const Directory* directory) {
        return directory->dirty || isUncertain(*directory);
    });
    for (Directory* const directory : wanted) {
        // Watched before it is read, so that no change falls between the two. Watched again, for
        // another directory may have taken its place, even with the same inode, and taken no watch
        // along.
        startWatching(*directory, absolute(directory->path()));
    }
    std::vector<Reading> readings(wanted.size());
    shareOut(wanted.size(), [&](std::size_t index, std::size_t worker) {
        Directory& directory = *wanted[index];
        if (!stop.stop_requested()) {
            directory.dirty = false;
            readings[index] = readDirectory(directory, absolute(directory.path()), canonicalRoot_,
                                            kinds_[worker]);
        }
    });
    std::ranges::for_each(wanted, [this](Directory* directory) { note(*directory); });
    for (Reading& reading : readings) {
        news_.otherNames = news_.otherNames || reading.otherNames;
        news_.otherPlaylists = news_.otherPlaylists || reading.otherPlaylists;
        std::ranges::for_each(reading.dropped, [this](auto& dropped) { drop(std::move(dropped)); });
    }
}

/// So few at a time that a directory with many is read by all workers.
void FolderTree::readPlaylists(const std::stop_token& stop) const {
    struct Some {
        Directory* directory;
        std::size_t begin;
    };

    constexpr std::size_t atATime = 8;
    std::vector<Some> work;
    for (Directory* const directory : news_.touched) {
        for (std::size_t begin = 0; begin < directory->playlists.size(); begin += atATime) {
            work.push_back({directory, begin});
        }
    }
    shareOut(work.size(), [&](std::size_t index, std::size_t) {
        Directory& directory = *work[index].directory;
        const std::size_t begin = work[index].begin;
        if (!stop.stop_requested() && !directory.gone) {
            media::readPlaylists(directory, absolute(directory.path()), begin,
                                 std::min(begin + atATime, directory.playlists.size()));
        }
    });
}

void FolderTree::settle(const Directories& visited) {
    for (Directory* const directory : visited) {
        directory->pending = false;
    }
    for (Directory* const directory : visited) {
        if (isUncertain(*directory)) {
            makePending(*directory);
        }
    }
}

void FolderTree::startWatching(Directory& directory, const std::string& path) {
    if (watch_ == nullptr) {
        return;
    }
    const std::optional<int> watch = watch_->add(path);
    if (directory.watch != watch) {
        stopWatching(directory);
    }
    directory.watch = watch;
    if (watch) {
        watched_[*watch] = &directory;
    }
}

void FolderTree::stopWatching(const Directory& directory) {
    // A directory that was moved within the folder may be watched under its new name already.
    const auto found = directory.watch ? watched_.find(*directory.watch) : watched_.end();
    if (found != watched_.end() && found->second == &directory) {
        watch_->remove(found->first);
        watched_.erase(found);
    }
}

void FolderTree::drop(std::unique_ptr<Directory> top) {
    forEachDirectory(*top, [this](Directory& directory) {
        stopWatching(directory);
        directory.gone = true;
    });
    dropped_.push_back(std::move(top));
}

} // namespace quorl::media
