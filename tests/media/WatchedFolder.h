#pragma once

#include <condition_variable>
#include <cstddef>
#include <filesystem>
#include <functional>
#include <memory>
#include <mutex>

#include "services/media/MusicFolder.h"

namespace quorl::media::test {

/// A music folder, and what it told.
class WatchedFolder {
  public:
    using Predicate = std::function<bool(const Inventory&)>;

    /// Begins to watch and waits for the first inventory.
    explicit WatchedFolder(const std::filesystem::path& root);

    ~WatchedFolder() { release(); }

    WatchedFolder(const WatchedFolder&) = delete;
    WatchedFolder& operator=(const WatchedFolder&) = delete;

    /// Waits until the last inventory is as `predicate` wants it, and gives it. Throws after a
    /// minute.
    std::shared_ptr<const Inventory> waitFor(const Predicate& predicate);

    /// Waits until the playlist of this path is there and lists `count` songs.
    std::shared_ptr<const Inventory> waitForSongs(std::string_view playlist, std::size_t count);

    /// Has all read again and waits until that is done.
    void rescan();

    /// How many inventories were handed out.
    [[nodiscard]] std::size_t calls() const;

    /// Has the folder's thread wait, as soon as it hands out the next inventory, until `release`.
    void holdNextCall();
    void waitUntilHeld();
    void release();

  private:
    void take(std::shared_ptr<const Inventory> inventory);
    void waitUntil(std::unique_lock<std::mutex>& lock, const std::function<bool()>& condition);

    mutable std::mutex mutex_;
    std::condition_variable changed_;
    std::shared_ptr<const Inventory> last_;
    std::size_t calls_ = 0;
    bool hold_ = false;
    bool held_ = false;
    /// Last: it calls into the rest.
    MusicFolder folder_;
};

} // namespace quorl::media::test
