#pragma once

#include <condition_variable>
#include <memory>
#include <mutex>
#include <string>
#include <vector>

#include <sdbus-c++/sdbus-c++.h>
#include <sys/types.h>

namespace quorl::syncd::testing {

/// What stands on the session bus for an engine, and notes who says that a person watches it.
class WatchedEngine {
  public:
    WatchedEngine();
    ~WatchedEngine();

    WatchedEngine(const WatchedEngine&) = delete;
    WatchedEngine& operator=(const WatchedEngine&) = delete;

    /// Waits for the next of the calls: "Watch" or "Unwatch".
    [[nodiscard]] std::string nextCall();

    /// The process that has called last, as long as it is there.
    [[nodiscard]] pid_t caller();

  private:
    void note(const char* method);

    std::mutex mutex_;
    std::condition_variable more_;
    std::vector<std::string> calls_;
    std::size_t read_ = 0;
    std::string caller_; ///< its unique name
    std::unique_ptr<sdbus::IConnection> connection_;
    std::unique_ptr<sdbus::IObject> object_;
};

} // namespace quorl::syncd::testing
