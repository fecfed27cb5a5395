#include "tests/media/WatchedFolder.h"

#include <algorithm>
#include <chrono>
#include <stdexcept>
#include <utility>

#include "tests/media/Inventories.h"

namespace quorl::media::test {

namespace {

/// Only a test that fails anyway waits so long.
constexpr std::chrono::seconds patience{60};

} // namespace

WatchedFolder::WatchedFolder(const std::filesystem::path& root)
    : folder_(root,
              [this](std::shared_ptr<const Inventory> inventory) { take(std::move(inventory)); }) {
    waitFor([](const Inventory&) { return true; });
}

std::shared_ptr<const Inventory> WatchedFolder::waitFor(const Predicate& predicate) {
    std::unique_lock lock(mutex_);
    waitUntil(lock, [&] { return last_ && predicate(*last_); });
    return last_;
}

std::shared_ptr<const Inventory> WatchedFolder::waitForSongs(std::string_view playlist,
                                                             std::size_t count) {
    return waitFor([&](const Inventory& inventory) {
        return std::ranges::any_of(inventory.playlists, [&](const Playlist& candidate) {
            return candidate.path == playlist && candidate.songs.size() == count;
        });
    });
}

void WatchedFolder::rescan() {
    bool done = false;
    folder_.rescan([&] {
        const std::lock_guard lock(mutex_);
        done = true;
        changed_.notify_all();
    });
    std::unique_lock lock(mutex_);
    waitUntil(lock, [&] { return done; });
}

std::size_t WatchedFolder::calls() const {
    const std::lock_guard lock(mutex_);
    return calls_;
}

void WatchedFolder::holdNextCall() {
    const std::lock_guard lock(mutex_);
    hold_ = true;
}

void WatchedFolder::waitUntilHeld() {
    std::unique_lock lock(mutex_);
    waitUntil(lock, [this] { return held_; });
}

void WatchedFolder::release() {
    const std::lock_guard lock(mutex_);
    hold_ = false;
    changed_.notify_all();
}

void WatchedFolder::take(std::shared_ptr<const Inventory> inventory) {
    std::unique_lock lock(mutex_);
    last_ = std::move(inventory);
    ++calls_;
    held_ = hold_;
    changed_.notify_all();
    changed_.wait(lock, [this] { return !hold_; });
    held_ = false;
}

void WatchedFolder::waitUntil(std::unique_lock<std::mutex>& lock,
                              const std::function<bool()>& condition) {
    if (!changed_.wait_for(lock, patience, condition)) {
        hold_ = false;
        changed_.notify_all();
        throw std::runtime_error("The music folder did not tell what was waited for.");
    }
}

} // namespace quorl::media::test
