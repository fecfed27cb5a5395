#pragma once

#include <algorithm>
#include <chrono>
#include <utility>

namespace quorl::syncd {

/// How long to wait before what did not work is tried again: twice as long after each failure, up
/// to an hour.
class RetryDelay {
  public:
    explicit RetryDelay(std::chrono::seconds first) : first_(first), next_(first) {}

    /// After a failure.
    [[nodiscard]] std::chrono::seconds next() {
        return std::exchange(next_, std::max(first_, std::min(next_ * 2, longest)));
    }

    /// After a success.
    void reset() { next_ = first_; }

  private:
    static constexpr std::chrono::seconds longest = std::chrono::hours{1};

    std::chrono::seconds first_;
    std::chrono::seconds next_;
};

} // namespace quorl::syncd
