#include "runtime/objects/MainQueue.h"

#include <cstdint>

#include <dispatch/dispatch.h>
#include <unistd.h>

// libdispatch exports these two for event loops and declares them in no installed header.
extern "C" {
int _dispatch_get_main_queue_handle_4CF(void);
void _dispatch_main_queue_callback_4CF(void* message);
}

namespace quorl {

int mainQueueDescriptor() { return _dispatch_get_main_queue_handle_4CF(); }

void drainMainQueue() {
    // Unread, the descriptor would stay readable and the loop would spin.
    std::uint64_t wakeups = 0;
    [[maybe_unused]] const auto length = read(mainQueueDescriptor(), &wakeups, sizeof wakeups);
    _dispatch_main_queue_callback_4CF(nullptr);
}

} // namespace quorl
