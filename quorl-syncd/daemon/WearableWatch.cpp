#include "quorl-syncd/daemon/WearableWatch.h"

#include <array>
#include <optional>
#include <utility>

#include <poll.h>
#include <sys/eventfd.h>

#include "services/base/DirectoryWatch.h"
#include "services/base/MountWatch.h"
#include "services/base/RootWatch.h"
#include "services/wearable/Wearable.h"

namespace quorl::syncd {

namespace {

/// For a thread that hangs when it is no longer wanted.
constexpr std::chrono::milliseconds patience{100};

/// Somebody who removes an album removes many songs.
constexpr std::chrono::milliseconds quietTime{500};

/// The watches of one wearable. One thread.
class Watches {
  public:
    explicit Watches(const std::filesystem::path& root) : root_(root), way_(root), mounts_(root) {
        watchContents();
    }

    /// Waits until there is news, or `end` is readable.
    [[nodiscard]] std::optional<WearableNews> next(int end) {
        std::array<pollfd, 4> polled{pollfd{end, POLLIN, 0}, pollfd{way_.descriptor(), POLLIN, 0},
                                     pollfd{mounts_.descriptor(), POLLPRI, 0},
                                     pollfd{contents_.descriptor(), POLLIN, 0}};
        poll(polled.data(), polled.size(), -1);
        const auto& [ended, way, mounts, contents] = polled;
        const bool isOtherWay = way.revents != 0 && way_.take();
        const bool isOtherMount = mounts.revents != 0 && mounts_.take();
        const bool isOther = isOtherWay || isOtherMount;
        if (isOther || contents.revents != 0) {
            static_cast<void>(contents_.take());
            watchContents();
        }
        if (isOther) {
            return WearableNews::MayBeAnother;
        }
        return contents.revents != 0 ? std::optional(WearableNews::MayHaveChanged) : std::nullopt;
    }

  private:
    /// The directory of the music comes and goes.
    void watchContents() {
        static_cast<void>(contents_.add(root_));
        static_cast<void>(contents_.add(root_ / wearable::musicDirectory));
    }

    const std::filesystem::path root_;
    base::RootWatch way_;
    base::MountWatch mounts_;
    base::DirectoryWatch contents_;
};

/// Readable once a stop was requested.
class StopDescriptor {
  public:
    explicit StopDescriptor(const std::stop_token& stop) : wake_(stop, Wake{descriptor_.get()}) {}

    [[nodiscard]] int get() const { return descriptor_.get(); }

    /// False: the stop was requested meanwhile.
    [[nodiscard]] bool wait(std::chrono::milliseconds time) const {
        pollfd polled{descriptor_.get(), POLLIN, 0};
        return poll(&polled, 1, static_cast<int>(time.count())) == 0;
    }

  private:
    struct Wake {
        int descriptor;

        void operator()() const { static_cast<void>(eventfd_write(descriptor, 1)); }
    };

    const base::FileDescriptor descriptor_{eventfd(0, EFD_CLOEXEC | EFD_NONBLOCK)};
    const std::stop_callback<Wake> wake_;
};

void watch(const std::filesystem::path& root, const WearableWatch::Tell& tell,
           const std::stop_token& stop) {
    const StopDescriptor end(stop);
    Watches watches(root);
    // What happened until now was not noticed.
    tell(WearableNews::MayHaveChanged);
    while (!stop.stop_requested()) {
        if (const auto news = watches.next(end.get())) {
            tell(*news);
        }
        if (!end.wait(quietTime)) {
            return;
        }
    }
}

} // namespace

WearableWatch::WearableWatch(const std::filesystem::path& root, Tell tell)
    : errand_(
          [root, tell = std::move(tell)](const std::stop_token& stop) { watch(root, tell, stop); },
          patience) {}

} // namespace quorl::syncd
