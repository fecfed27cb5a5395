#include "services/media/MusicFolder.h"

#include <array>
#include <cerrno>
#include <chrono>
#include <mutex>
#include <optional>
#include <stop_token>
#include <system_error>
#include <type_traits>
#include <utility>
#include <vector>

#include <malloc.h>
#include <poll.h>
#include <sys/eventfd.h>

#include "services/base/DirectoryWatch.h"
#include "services/base/FileDescriptor.h"
#include "services/base/MountWatch.h"
#include "services/base/Paths.h"
#include "services/base/RootWatch.h"
#include "services/media/FolderTree.h"
#include "services/media/InventoryBuilder.h"

namespace quorl::media {

namespace {

using Clock = std::chrono::steady_clock;

// A program that copies an album makes hundreds of changes within moments of each other. Building
// the inventory costs some milliseconds however small the change, so it waits until the folder has
// been quiet for a moment; a copy that never rests is shown in steps all the same.
constexpr std::chrono::milliseconds quietTime{50};
constexpr std::chrono::milliseconds longestWait{500};

/// For the thread of a folder that is no longer wanted.
constexpr std::chrono::seconds patience{1};

std::filesystem::path absoluteRoot(const std::filesystem::path& root) {
    return base::normal(std::filesystem::absolute(root));
}

/// While an inventory is built, the one before is still there. What that leaves free amounts to a
/// third of all that a large folder needs, and the allocator would keep it for the rest of the
/// process.
void giveBackMemory() { malloc_trim(0); }

base::FileDescriptor makeWakeUp() {
    base::FileDescriptor descriptor(eventfd(0, EFD_NONBLOCK | EFD_CLOEXEC));
    if (!descriptor) {
        throw std::system_error(errno, std::generic_category(),
                                "The music folder cannot be watched");
    }
    return descriptor;
}

} // namespace

std::shared_ptr<const Inventory> scan(const std::filesystem::path& root) {
    FolderTree tree(absoluteRoot(root), nullptr);
    const std::stop_token never;
    static_cast<void>(tree.refresh(never));
    return InventoryBuilder(tree).build(never);
}

class MusicFolder::Worker {
  public:
    Worker(const std::filesystem::path& root, Changed changed)
        : changed_(std::move(changed)), tree_(root, &directoryWatch_) {}

    /// On the folder's own thread, once; returns when it was stopped.
    void run(const std::stop_token& stop) {
        const std::stop_callback wakeForStop(stop, [this] { wakeUp(); });
        rootWatch_.emplace(tree_.root());
        mountWatch_.emplace(tree_.root());
        while (!stop.stop_requested()) {
            work(stop);
        }
    }

    /// Waits for a call that is under way; none is made afterwards.
    void close() {
        const std::lock_guard lock(telling_);
        isClosed_ = true;
    }

    std::shared_ptr<const Inventory> inventory() const {
        const std::lock_guard lock(mutex_);
        return snapshot_;
    }

    void rescan(std::function<void()> done) {
        {
            const std::lock_guard lock(mutex_);
            rescans_.push_back(std::move(done));
        }
        wakeUp();
    }

  private:
    using Rescans = std::vector<std::function<void()>>;

    /// Reads what is to be read, and waits for more.
    void work(const std::stop_token& stop) {
        const Rescans rescans = takeRescans();
        if (!rescans.empty()) {
            tree_.markAll();
        }
        if (tree_.isDirty()) {
            if (!update(stop)) {
                return;
            }
            giveBackMemory();
        }
        for (const auto& done : rescans) {
            tell(done);
        }
        waitForChanges(stop);
    }

    template <class... Given>
    void tell(const std::function<void(Given...)>& call, std::type_identity_t<Given>... given) {
        const std::lock_guard lock(telling_);
        if (call && !isClosed_) {
            call(std::move(given)...);
        }
    }

    /// Reads what changed, and hands out what comes of it. False: stopped.
    bool update(const std::stop_token& stop) {
        if (!tree_.refresh(stop)) {
            return false;
        }
        auto next = builder_.build(stop);
        if (!next) {
            return false;
        }
        if (snapshot_ && *snapshot_ == *next) {
            return true;
        }
        {
            const std::lock_guard lock(mutex_);
            snapshot_ = next;
        }
        tell(changed_, std::move(next));
        return true;
    }

    Rescans takeRescans() {
        const std::lock_guard lock(mutex_);
        return std::exchange(rescans_, {});
    }

    /// Returns once there is something to read again, or when woken up.
    void waitForChanges(const std::stop_token& stop) {
        using namespace std::chrono;
        constexpr milliseconds forever{-1};
        if (!takeChanges(forever)) {
            return;
        }
        const Clock::time_point latest = Clock::now() + longestWait;
        while (tree_.isDirty() && !stop.stop_requested() && Clock::now() < latest &&
               takeChanges(quietTime)) {
        }
    }

    /// Waits for a change for at most so long, and marks what changed. False: nothing changed in
    /// that time, or the thread was woken up.
    bool takeChanges(std::chrono::milliseconds longest) {
        std::array<pollfd, 4> descriptors{pollfd{wakeUp_.get(), POLLIN, 0},
                                          pollfd{rootWatch_->descriptor(), POLLIN, 0},
                                          pollfd{directoryWatch_.descriptor(), POLLIN, 0},
                                          pollfd{mountWatch_->descriptor(), POLLPRI, 0}};
        const auto& [woken, root, directories, mounts] = descriptors;
        if (poll(descriptors.data(), descriptors.size(), static_cast<int>(longest.count())) <= 0) {
            return false;
        }
        if (woken.revents != 0) {
            eventfd_t count = 0;
            eventfd_read(wakeUp_.get(), &count);
            return false;
        }
        if (directories.revents != 0) {
            tree_.mark(directoryWatch_.take());
        }
        const bool rootChanged = root.revents != 0 && rootWatch_->take();
        const bool mountsChanged = mounts.revents != 0 && mountWatch_->take();
        if (rootChanged || mountsChanged) {
            tree_.reset();
        }
        return true;
    }

    void wakeUp() { eventfd_write(wakeUp_.get(), 1); }

    const Changed changed_;
    const base::FileDescriptor wakeUp_ = makeWakeUp();

    // The folder's own thread only. It also makes those that look at the folder when they are made,
    // for a drive that does not answer may keep them waiting.
    std::optional<base::RootWatch> rootWatch_;
    std::optional<base::MountWatch> mountWatch_;
    base::DirectoryWatch directoryWatch_;
    FolderTree tree_;
    InventoryBuilder builder_{tree_};

    /// Held during each call to outside.
    std::mutex telling_;
    bool isClosed_ = false;

    mutable std::mutex mutex_;
    /// Written by the folder's own thread only.
    std::shared_ptr<const Inventory> snapshot_;
    Rescans rescans_;
};

MusicFolder::MusicFolder(const std::filesystem::path& root, Changed changed)
    : worker_(std::make_shared<Worker>(absoluteRoot(root), std::move(changed))),
      errand_([worker = worker_](const std::stop_token& stop) { worker->run(stop); }, patience) {}

MusicFolder::~MusicFolder() {
    errand_.stop();
    worker_->close();
}

std::shared_ptr<const Inventory> MusicFolder::inventory() const { return worker_->inventory(); }

void MusicFolder::rescan(std::function<void()> done) { worker_->rescan(std::move(done)); }

} // namespace quorl::media
