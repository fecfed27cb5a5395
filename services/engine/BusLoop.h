#pragma once

#include <chrono>
#include <functional>
#include <map>
#include <memory>
#include <mutex>
#include <string>
#include <vector>

#include <sdbus-c++/sdbus-c++.h>

#include "services/base/FileDescriptor.h"

namespace quorl::engine {

/// The event loop of a thread: a bus connection, file descriptors, timers, and closures that other
/// threads hand over. All of them are served on the thread that is in `run`, one at a time.
class BusLoop {
  public:
    using Work = std::function<void()>;
    using Clock = std::chrono::steady_clock;

    /// @param bus nobody else runs a loop on it. Null: the loop serves everything else.
    explicit BusLoop(std::unique_ptr<sdbus::IConnection> bus);

    BusLoop(const BusLoop&) = delete;
    BusLoop& operator=(const BusLoop&) = delete;

    /// Not to be called without a bus.
    [[nodiscard]] sdbus::IConnection& bus() { return *bus_; }

    /// Has `task` called by `run`, after those that were handed over before. Any thread; never
    /// waits. What was not called when the loop ended is destroyed with it.
    void post(Work task);

    /// Has `ready` called while the descriptor shows one of these events of poll(2). `ready` may
    /// call `unwatch`.
    void watch(int descriptor, short events, Work ready);
    void unwatch(int descriptor);

    /// Has `task` called once, no sooner than at this time.
    void callAt(Clock::time_point time, Work task);

    /// Serves everything until `stop` is called or the bus is gone. Gives back an empty text, or
    /// says why the bus is gone; a further call then serves everything else.
    [[nodiscard]] std::string run();

    /// Makes `run` return. Any thread.
    void stop();

  private:
    struct Watched {
        short events;
        Work ready;
    };

    /// Whether there was a message; there may be more then.
    bool serveBus();
    [[nodiscard]] int timeout() const;
    void wait(int milliseconds);
    void callReady(int descriptor);
    void callPosted();
    void callDue();

    const std::unique_ptr<sdbus::IConnection> bus_;
    const base::FileDescriptor wake_;
    std::map<int, Watched> watched_;
    std::multimap<Clock::time_point, Work> timers_;

    std::mutex mutex_;
    std::vector<Work> posted_;
    bool stopped_ = false;
    bool isBusThere_;
};

} // namespace quorl::engine
