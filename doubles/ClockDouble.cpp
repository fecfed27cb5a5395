#include "doubles/ClockDouble.h"

#include "doubles/virtual-time/VirtualTime.h"

namespace quorl {

namespace {

using std::chrono::nanoseconds;

/// The sum, or what comes nearest to it where it does not fit.
nanoseconds saturatedSum(nanoseconds left, nanoseconds right) {
    std::int64_t sum = 0;
    if (__builtin_add_overflow(left.count(), right.count(), &sum)) {
        return right.count() < 0 ? nanoseconds::min() : nanoseconds::max();
    }
    return nanoseconds(sum);
}

} // namespace

nanoseconds ClockDouble::read() {
    const auto time = static_cast<std::int64_t>(VirtualTime::shared().now());
    const nanoseconds reading = saturatedSum(nanoseconds(time), offset_);
    moveBy(tick_);
    return reading;
}

void ClockDouble::moveBy(nanoseconds duration) { offset_ = saturatedSum(offset_, duration); }

} // namespace quorl
