#pragma once

#include <filesystem>

#include "runtime/services/AnnouncingLibrary.h"
#include "services/media/MusicFolder.h"
#include "services/media/kept/InventoryKeeper.h"

namespace quorl {

class LibraryPlaylist;

/// The music folder as the platform's media library. Made by `create`. Main thread.
class MusicLibrary final : public AnnouncingLibrary {
  public:
    /// Is called on the main thread with each inventory that the library has taken from the folder.
    using Taken = std::function<void(const media::Inventory& inventory)>;

    /// Writes down what the folder held where that is not in the file of `keepIn` yet.
    ~MusicLibrary() override;

    /// From now on the first folder that is opened shows what it held when it was last read by a
    /// program, until it has been read anew. That is kept in `file`.
    void keepIn(std::filesystem::path file) { keptFile_ = std::move(file); }

    /// Begins to read and watch the folder at `root`, on a thread of its own, instead of the one
    /// before, whose contents stay until this one has been read. Throws `std::system_error` where
    /// the process may open no more files or start no more threads.
    void open(const std::filesystem::path& root, Taken taken);

    /// Whether the folder has been read for the first time. Until then the library is empty, or
    /// what was kept.
    [[nodiscard]] bool isRead() const { return isRead_; }

    /// What the folder held when it was last read; null where that is not known.
    [[nodiscard]] const std::shared_ptr<const media::Inventory>& inventory() const {
        return inventory_;
    }

    [[nodiscard]] bool hasMediaOfType(NSUInteger mask) const override;
    [[nodiscard]] NSArray<MPMediaPlaylist>
    playlistsMatching(const Predicates& predicates) const override;

  private:
    void show(std::shared_ptr<const media::Inventory> inventory);
    void take(std::shared_ptr<const media::Inventory> inventory);

    std::filesystem::path keptFile_;                 ///< empty for none
    std::shared_ptr<media::InventoryKeeper> keeper_; ///< of the folder; null for none
    bool isRead_ = false;
    std::uint64_t foldersOpened_ = 0;
    std::shared_ptr<const media::Inventory> inventory_;
    std::vector<std::shared_ptr<LibraryPlaylist>> playlists_; ///< in the order of the inventory
    Taken taken_;
    std::unique_ptr<media::MusicFolder> folder_; ///< last: its thread ends first
};

} // namespace quorl
