// Two closures on a concurrent queue write to one number, and nothing orders them. The thread
// sanitizer has to tell, or nothing that it says of the other tests means anything.

#include <atomic>
#include <thread>

#include <dispatch/dispatch.h>

namespace {

struct Meeting {
    std::atomic<int> arrived = 0;
    dispatch_semaphore_t done = dispatch_semaphore_create(0);
};

int written = 0; // the report names it

/// Meets the other one, which orders nothing, and writes.
void race(void* context) {
    auto& meeting = *static_cast<Meeting*>(context);
    meeting.arrived.fetch_add(1, std::memory_order_relaxed);
    while (meeting.arrived.load(std::memory_order_relaxed) < 2) {
        std::this_thread::yield();
    }
    ++written;
    dispatch_semaphore_signal(meeting.done);
}

} // namespace

int main() {
    Meeting meeting;
    const auto queue = dispatch_queue_create("org.quorl.planted-race", DISPATCH_QUEUE_CONCURRENT);
    dispatch_async_f(queue, &meeting, race);
    dispatch_async_f(queue, &meeting, race);
    dispatch_semaphore_wait(meeting.done, DISPATCH_TIME_FOREVER);
    dispatch_semaphore_wait(meeting.done, DISPATCH_TIME_FOREVER);
    return written == 2 ? 0 : 1;
}
