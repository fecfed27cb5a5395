#include "services/media/FolderTree.h"

#include <algorithm>
#include <optional>
#include <system_error>
#include <utility>

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
bool mayHaveChanged(const Directory& directory) {
    return directory.dirty || directory.hasLinks || directory.unreadable;
}

} // namespace

FolderTree::FolderTree(std::filesystem::path root, base::DirectoryWatch* watch)
    : root_(std::move(root)), watch_(watch) {}

void FolderTree::reset() {
    if (top_) {
        stopWatchingAll(*top_);
        top_.reset();
    }
    dirty_ = true;
}

void FolderTree::markAll() {
    if (top_) {
        forEachDirectory(*top_, [](Directory& directory) { directory.dirty = true; });
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
        }
    }
}

bool FolderTree::refresh(const std::stop_token& stop) {
    if (!top_) {
        findTop();
    }
    if (top_) {
        forEachDirectory(*top_, [this, &stop](Directory& directory) {
            if (mayHaveChanged(directory) && !stop.stop_requested()) {
                read(directory);
            }
        });
    }
    if (stop.stop_requested()) {
        return false;
    }
    dirty_ = false;
    return true;
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

void FolderTree::read(Directory& directory) {
    const std::string path = absolute(directory.path());
    directory.dirty = false;
    // Watched before it is read, so that no change falls between the two. Watched again, for
    // another directory may have taken its place, even with the same inode, and taken no watch
    // along.
    startWatching(directory, path);
    for (const auto& dropped : readDirectory(directory, path, canonicalRoot_, kinds_)) {
        stopWatchingAll(*dropped);
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

void FolderTree::stopWatchingAll(Directory& top) {
    forEachDirectory(top, [this](const Directory& directory) { stopWatching(directory); });
}

} // namespace quorl::media
