#pragma once

#include <chrono>

#include "doubles/virtual-time/VirtualTime.h"

/// A test as the event loop of a program in virtual time. Main thread only.
namespace quorl::tests {

/// Runs all that is on the main queue, and what that work queues there in turn.
inline void drain() { VirtualTime::shared().drain(); }

/// Runs what is on the main queue, then lets time pass with all that falls due on the way.
inline void advance(std::chrono::nanoseconds duration) {
    drain();
    VirtualTime::shared().advance(static_cast<VirtualTime::Nanoseconds>(duration.count()));
}

} // namespace quorl::tests
