#pragma once

#include <cstddef>
#include <filesystem>
#include <memory>
#include <stop_token>
#include <string>
#include <unordered_map>
#include <vector>

#include "services/base/DirectoryWatch.h"
#include "services/media/ContentKinds.h"
#include "services/media/Directory.h"

namespace quorl::media {

/// The directories of a music folder as far as they were read, and which of them have to be read
/// again. For one thread at a time. Holds nothing open in the folder, so that its disk can be
/// unmounted.
class FolderTree {
  public:
    /// What became known since somebody took it in.
    struct News {
        /// Directories that were read or noted, each once; some of them may be gone.
        std::vector<Directory*> touched;
        /// Songs or directories came or went.
        bool otherNames = false;
        /// The playlists, or which directories can be read, may be others.
        bool otherPlaylists = false;
    };

    /// `root` is absolute. `watch` is told of every directory and outlives the tree; null: nobody
    /// watches. Reads nothing yet.
    FolderTree(std::filesystem::path root, base::DirectoryWatch* watch);

    /// Forgets everything: the folder, or a part of it, may be another one by now.
    void reset();

    /// Has every directory read again. Playlists whose files did not change keep their contents.
    void markAll();

    /// Has the directories read again that `changes` names.
    void mark(const base::DirectoryWatch::Changes& changes);

    /// Something was marked, or nothing was read yet.
    [[nodiscard]] bool isDirty() const { return dirty_; }

    /// Reads what is dirty, on all cores. False: stopped before the end; call again to go on.
    [[nodiscard]] bool refresh(const std::stop_token& stop);

    [[nodiscard]] const News& news() const { return news_; }

    /// Counts `directory` among those that were touched.
    void note(Directory& directory);

    /// The news were taken in. Until then a directory that is gone is still there.
    void forgetNews();

    /// The music folder as it was given.
    [[nodiscard]] const std::filesystem::path& root() const { return root_; }

    /// The music folder without symbolic links and without a slash at its end: empty for "/".
    [[nodiscard]] const std::string& canonicalRoot() const { return canonicalRoot_; }

    /// The music folder's own directory; null: it was not found.
    [[nodiscard]] Directory* top() const { return top_.get(); }

    /// All directories, each before those in it; among those of one directory, in order of names.
    [[nodiscard]] std::vector<Directory*> directories() const;

    /// How many directories could be read but not watched.
    [[nodiscard]] std::size_t unwatchedDirectories() const;

    /// The path by which to open `path`, which is relative to the music folder.
    [[nodiscard]] std::string absolute(const std::string& path) const;

  private:
    using Directories = std::vector<Directory*>;

    void findTop();
    void read(const Directories& visited, const std::stop_token& stop);
    void readPlaylists(const std::stop_token& stop) const;
    void settle(const Directories& visited);
    void drop(std::unique_ptr<Directory> top);
    void startWatching(Directory& directory, const std::string& path);
    void stopWatching(const Directory& directory);

    const std::filesystem::path root_;
    base::DirectoryWatch* const watch_;
    std::string canonicalRoot_;
    std::unique_ptr<Directory> top_;
    std::unordered_map<int, Directory*> watched_;
    /// Of each worker its own.
    std::vector<ContentKinds> kinds_;
    bool dirty_ = true;
    News news_;
    /// That are gone, until the news are forgotten.
    Dropped dropped_;
};

} // namespace quorl::media
