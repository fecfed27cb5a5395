#pragma once

#include <cstdlib>

namespace quorl::fuzz {

/// Ends the process, which the fuzzer takes for a find, where `condition` does not hold.
inline void demand(bool condition) {
    if (!condition) {
        std::abort();
    }
}

} // namespace quorl::fuzz
