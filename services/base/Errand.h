#pragma once

#include <chrono>
#include <functional>
#include <memory>
#include <stop_token>
#include <thread>

namespace quorl::base {

/// Work on a thread of its own that a device may keep waiting for ever. Whoever has sent it out
/// waits for its end as long as that is bearable, and then goes on without it. One thread.
class Errand {
  public:
    /// Owns all that it uses, for it may outlive everything else. Ends soon after it was asked to,
    /// as far as its device lets it. Must not throw.
    using Work = std::function<void(const std::stop_token&)>;

    /// @param patience how long the end is waited for, from the first call of `stop`.
    /// Throws `std::system_error` where no thread can be started.
    Errand(Work work, std::chrono::milliseconds patience);

    /// Stops the work. Where it does not end in time, its thread is left behind.
    ~Errand();

    Errand(const Errand&) = delete;
    Errand& operator=(const Errand&) = delete;

    /// Has the work end soon. Returns at once.
    void stop();

  private:
    struct Shared;

    const std::shared_ptr<Shared> shared_;
    const std::chrono::milliseconds patience_;
    std::chrono::steady_clock::time_point deadline_;
    std::thread thread_;
};

/// Held for a thread for which nobody waits for ever, from before it begins until it ends.
class LooseThread {
  public:
    LooseThread();
    ~LooseThread();

    LooseThread(const LooseThread&) = delete;
    LooseThread& operator=(const LooseThread&) = delete;
};

/// Ends the program: gives back `code`, to be returned by `main`. Where a loose thread still runs,
/// the process ends here and now, for that thread may use what `exit` takes down.
[[nodiscard]] int endOfProgram(int code);

} // namespace quorl::base
