#pragma once

#include <filesystem>

#include "runtime/services/AnnouncingLibrary.h"
#include "services/media/MusicFolder.h"

namespace quorl {

class LibraryPlaylist;

/// The music folder as the platform's media library. Made by `create`. Main thread.
class MusicLibrary final : public AnnouncingLibrary {
  public:
    /// Is called on the main thread with each inventory that the library has taken.
    using Taken = std::function<void(const media::Inventory& inventory)>;

    /// Begins to read and watch the folder at `root`, on a thread of its own, instead of the one
    /// before, whose contents stay until this one has been read. Throws `std::system_error` where
    /// the process may open no more files or start no more threads.
    void open(const std::filesystem::path& root, Taken taken);

    /// Whether the folder has been read for the first time. Until then the library is empty.
    [[nodiscard]] bool isRead() const { return inventory_ != nullptr; }

    /// What the folder held when it was last read; null before the first time.
    [[nodiscard]] const std::shared_ptr<const media::Inventory>& inventory() const {
        return inventory_;
    }

    [[nodiscard]] bool hasMediaOfType(NSUInteger mask) const override;
    [[nodiscard]] NSArray<MPMediaPlaylist>
    playlistsMatching(const Predicates& predicates) const override;

  private:
    void take(std::shared_ptr<const media::Inventory> inventory);

    std::uint64_t foldersOpened_ = 0;
    std::shared_ptr<const media::Inventory> inventory_;
    std::vector<std::shared_ptr<LibraryPlaylist>> playlists_; ///< in the order of the inventory
    Taken taken_;
    std::unique_ptr<media::MusicFolder> folder_; ///< last: its thread ends first
};

} // namespace quorl
