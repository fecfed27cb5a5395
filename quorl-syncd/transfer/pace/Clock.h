#pragma once

#include <chrono>

namespace quorl::syncd {

/// How time passes.
class Clock {
  public:
    using TimePoint = std::chrono::steady_clock::time_point;

    virtual ~Clock() = default;

    /// Never goes back. Any thread.
    [[nodiscard]] virtual TimePoint now() const = 0;
};

} // namespace quorl::syncd
