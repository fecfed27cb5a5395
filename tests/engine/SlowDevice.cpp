#include "tests/engine/SlowDevice.h"

#include <array>

#include <fcntl.h>
#include <poll.h>
#include <sys/eventfd.h>
#include <sys/fanotify.h>
#include <sys/mount.h>
#include <unistd.h>

namespace quorl::syncd::testing {

SlowDevice::SlowDevice() {
    isMounted_ = mount("tmpfs", folder_.path().c_str(), "tmpfs", 0, "size=16m") == 0;
    watch_ = base::FileDescriptor{fanotify_init(FAN_CLASS_CONTENT | FAN_CLOEXEC, O_CLOEXEC)};
    if (!isMounted_ || !watch_ ||
        fanotify_mark(watch_.get(), FAN_MARK_ADD | FAN_MARK_MOUNT, FAN_OPEN_PERM | FAN_ONDIR,
                      AT_FDCWD, folder_.path().c_str()) != 0) {
        return;
    }
    end_ = base::FileDescriptor{eventfd(0, EFD_CLOEXEC)};
    thread_ = std::jthread{[this] { answer(); }};
}

SlowDevice::~SlowDevice() {
    goOn();
    if (end_) {
        static_cast<void>(eventfd_write(end_.get(), 1));
        thread_.join();
    }
    // Whoever still waits goes on with its end.
    watch_ = {};
    if (isMounted_) {
        umount2(folder_.path().c_str(), MNT_DETACH);
    }
}

void SlowDevice::stall() {
    const std::scoped_lock lock{mutex_};
    isStalling_ = true;
}

void SlowDevice::awaitStalled() {
    std::unique_lock lock{mutex_};
    changed_.wait(lock, [this] { return isSomebodyWaiting_; });
}

void SlowDevice::goOn() {
    const std::scoped_lock lock{mutex_};
    isStalling_ = false;
    changed_.notify_all();
}

void SlowDevice::answer() {
    for (;;) {
        std::array<pollfd, 2> polled{{{watch_.get(), POLLIN, 0}, {end_.get(), POLLIN, 0}}};
        poll(polled.data(), polled.size(), -1);
        if (polled[1].revents != 0) {
            return;
        }
        fanotify_event_metadata event{};
        if (read(watch_.get(), &event, sizeof event) != sizeof event) {
            continue;
        }
        {
            std::unique_lock lock{mutex_};
            isSomebodyWaiting_ = isStalling_;
            changed_.notify_all();
            changed_.wait(lock, [this] { return !isStalling_; });
        }
        const fanotify_response response{event.fd, FAN_ALLOW};
        static_cast<void>(write(watch_.get(), &response, sizeof response));
        close(event.fd);
    }
}

} // namespace quorl::syncd::testing
