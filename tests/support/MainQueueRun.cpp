#include "tests/support/MainQueueRun.h"

#include <stdexcept>

#include <poll.h>

#include "platform/Dispatch.h"
#include "runtime/objects/MainQueue.h"

namespace quorl::tests {

namespace {

using Clock = std::chrono::steady_clock;

constexpr std::chrono::minutes patience{1};

/// Whether the main queue has work before `wait` is over.
bool hasWork(std::chrono::milliseconds wait) {
    pollfd readable{.fd = mainQueueDescriptor(), .events = POLLIN, .revents = 0};
    return poll(&readable, 1, static_cast<int>(wait.count())) == 1;
}

} // namespace

void runMainQueueUntil(const std::function<bool()>& isDone) {
    const auto end = Clock::now() + patience;
    while (!isDone()) {
        const auto left = std::chrono::ceil<std::chrono::milliseconds>(end - Clock::now());
        if (left.count() <= 0) {
            throw std::runtime_error("what the test waits for has not come within a minute");
        }
        if (hasWork(left)) {
            drainMainQueue();
        }
    }
}

void runQueuedWork() {
    while (hasWork(std::chrono::milliseconds::zero())) {
        drainMainQueue();
    }
}

void runMainQueuePast(std::chrono::milliseconds delay) {
    const auto isPast = std::make_shared<bool>(false);
    const auto nanoseconds = std::chrono::nanoseconds(delay).count();
    dispatch_after(dispatch_time(DISPATCH_TIME_NOW, nanoseconds), dispatch_get_main_queue(),
                   [isPast] { *isPast = true; });
    runMainQueueUntil([&isPast] { return *isPast; });
    runQueuedWork();
}

} // namespace quorl::tests
