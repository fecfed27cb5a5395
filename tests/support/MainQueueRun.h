#pragma once

#include <chrono>
#include <functional>

/// A test as the event loop of libdispatch's main queue. Main thread only.
namespace quorl::tests {

/// Runs the main queue until `isDone`, which is asked before the first and after each batch of
/// work. Throws where that does not come within a minute.
void runMainQueueUntil(const std::function<bool()>& isDone);

/// Runs all that is on the main queue, and what that work queues there in turn.
void runQueuedWork();

/// Runs the main queue until a timer that is set now for `delay` has fired. What was to run well
/// before that moment has run then.
void runMainQueuePast(std::chrono::milliseconds delay);

} // namespace quorl::tests
