#pragma once

namespace quorl {

/// How a host with an event loop of its own runs the work of libdispatch's main queue: it waits
/// until this descriptor is readable and then calls `drainMainQueue`. To be called first on the
/// main thread, before another thread is started. The descriptor is not the caller's to close.
[[nodiscard]] int mainQueueDescriptor();

/// Runs what the main queue holds. Main thread only; a call from within work of the queue does
/// nothing.
void drainMainQueue();

} // namespace quorl
