#pragma once

#include <chrono>

namespace quorl {

/// A wall clock that shows virtual time plus what it was moved by. Main thread.
class ClockDouble {
  public:
    /// The time since the start of 1970; every reading moves the clock on by the tick, after the
    /// reading.
    [[nodiscard]] std::chrono::nanoseconds read();

    void moveBy(std::chrono::nanoseconds duration);

    /// At first 0.
    void setTick(std::chrono::nanoseconds tick) { tick_ = tick; }

  private:
    std::chrono::nanoseconds offset_{0};
    std::chrono::nanoseconds tick_{0};
};

} // namespace quorl
