#pragma once

#include <stop_token>

namespace quorl::syncd {

/// Thrown where a sync is to end.
struct Stopped {};

/// Throws `Stopped` once `stop` was requested.
inline void stopIf(const std::stop_token& stop) {
    if (stop.stop_requested()) {
        throw Stopped();
    }
}

} // namespace quorl::syncd
