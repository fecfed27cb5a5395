#pragma once

#include <chrono>
#include <functional>
#include <map>
#include <memory>
#include <string>
#include <utility>

#include <sdbus-c++/sdbus-c++.h>

#include "services/engine/Mailbox.h"

namespace quorl::engine {

/// The event loop of a thread: a bus connection, file descriptors, timers, and closures that other
/// threads hand over. All of them are served on the thread that is in `run`, one at a time.
class BusLoop {
  public:
    using Work = Mailbox::Work;
    using Clock = std::chrono::steady_clock;

    /// @param bus nobody else runs a loop on it. Null: the loop serves everything else.
    explicit BusLoop(std::unique_ptr<sdbus::IConnection> bus);

    BusLoop(const BusLoop&) = delete;
    BusLoop& operator=(const BusLoop&) = delete;

    /// Not to be called without a bus.
    [[nodiscard]] sdbus::IConnection& bus() { return *bus_; }

    /// Has `task` called by `run`, after those that were handed over before. Any thread; never
    /// waits. What was not called when the loop ended is destroyed with it.
    void post(Work task) { mailbox_->post(std::move(task)); }

    /// Where threads post that may outlive the loop.
    [[nodiscard]] const std::shared_ptr<Mailbox>& mailbox() const { return mailbox_; }

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
    const std::shared_ptr<Mailbox> mailbox_;
    std::map<int, Watched> watched_;
    std::multimap<Clock::time_point, Work> timers_;

    bool stopped_ = false;
    bool isBusThere_;
};

} // namespace quorl::engine
