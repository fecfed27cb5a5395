#pragma once

#include <cstdint>
#include <functional>

#include "quorl-syncd/transfer/pace/Clock.h"

namespace quorl::syncd {

/// The time in which the engine lives. It does everything in turns, one at a time: a call by a
/// client, an event of a port, or work whose time has come. A turn that has begun ends before the
/// next begins.
class Turns : public Clock {
  public:
    using Work = std::function<void()>;

    /// Has `work` called once, in a later turn and no sooner than at this time. What was not called
    /// when the engine is destroyed must not be called any more.
    virtual void callAt(TimePoint time, Work work) = 0;

    /// The time of the calendar, in microseconds since 1970.
    [[nodiscard]] virtual std::uint64_t calendarTime() const = 0;
};

} // namespace quorl::syncd
