#include "platform/NSInteger.h"

#include <limits>

template <class Unsigned>
Unsigned NSSaturatingTruncate(double value) {
    constexpr auto largest = std::numeric_limits<Unsigned>::max();
    if (!(value > 0)) {
        return 0;
    }
    // The largest value itself may round up on its way to double, so that it cannot be compared
    // with.
    return value < static_cast<double>(largest) ? static_cast<Unsigned>(value) : largest;
}

template std::uint32_t NSSaturatingTruncate<std::uint32_t>(double);
template std::uint64_t NSSaturatingTruncate<std::uint64_t>(double);
