#pragma once

#include <condition_variable>
#include <mutex>
#include <thread>

#include "services/base/FileDescriptor.h"
#include "tests/base/TemporaryDirectory.h"

namespace quorl::syncd::testing {

/// A mounted file system on which every opening of a file or a directory can be held up. Wants the
/// rights to mount and to watch; all that is held up goes on when it is destroyed.
class SlowDevice {
  public:
    SlowDevice();
    ~SlowDevice();

    SlowDevice(const SlowDevice&) = delete;
    SlowDevice& operator=(const SlowDevice&) = delete;

    /// False: the rights are not there.
    [[nodiscard]] bool isThere() const { return watch_ && end_; }

    [[nodiscard]] std::string path() const { return folder_.path().string(); }

    /// Holds up whoever opens a file on the device from now on; not for the test itself.
    void stall();

    /// Waits until somebody is held up.
    void awaitStalled();

    /// Has all go on.
    void goOn();

  private:
    void answer();

    tests::TemporaryDirectory folder_;
    bool isMounted_ = false;
    base::FileDescriptor watch_;
    base::FileDescriptor end_;

    std::mutex mutex_;
    std::condition_variable changed_;
    bool isStalling_ = false;
    bool isSomebodyWaiting_ = false;

    std::jthread thread_;
};

} // namespace quorl::syncd::testing
