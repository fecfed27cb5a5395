#pragma once

#include <filesystem>
#include <functional>
#include <memory>

#include "services/base/Errand.h"
#include "services/media/Inventory.h"

namespace quorl::media {

/// Reads the music folder at `root` once, on the calling thread. Never null; a folder that is not
/// there gives an empty inventory with `rootFound` false.
[[nodiscard]] std::shared_ptr<const Inventory> scan(const std::filesystem::path& root);

/// A music folder that is watched from construction to destruction, on a thread of its own.
///
/// A folder that is missing, deleted, moved away or unmounted is an empty one until it is there
/// again.
class MusicFolder {
  public:
    /// Is given each inventory that differs from the one before, and the first. Called on the
    /// folder's own thread, one call at a time. Must not throw, nor destroy the folder.
    using Changed = std::function<void(std::shared_ptr<const Inventory>)>;

    /// Begins to read and watch `root`, which is taken as absolute, or relative to the working
    /// directory of this moment. Throws `std::system_error` where the process may open no more
    /// files or start no more threads.
    MusicFolder(const std::filesystem::path& root, Changed changed);

    /// Ends the thread, also in the midst of reading; no call is made afterwards. Where the device
    /// does not answer, the thread is waited for a second and then left behind.
    ~MusicFolder();

    MusicFolder(const MusicFolder&) = delete;
    MusicFolder& operator=(const MusicFolder&) = delete;

    /// The last inventory; null: the first is not ready yet. Any thread.
    [[nodiscard]] std::shared_ptr<const Inventory> inventory() const;

    /// Has everything read again, for changes that no watch tells: those made by other machines on
    /// a network drive, and those in `Inventory::unwatchedDirectories`. Returns at once; any
    /// thread.
    ///
    /// `done`, where given, is called on the folder's own thread once that has been read, after
    /// `Changed` if it made a difference. It is never called when the folder is destroyed before.
    void rescan(std::function<void()> done = {});

  private:
    class Worker;

    const std::shared_ptr<Worker> worker_;
    base::Errand errand_;
};

} // namespace quorl::media
