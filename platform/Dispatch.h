#pragma once

#include <concepts>
#include <functional>
#include <memory>
#include <type_traits>
#include <utility>

#include <dispatch/dispatch.h>

/// libdispatch with closures. The functions of <dispatch/dispatch.h> that take no closure
/// (`dispatch_time`, `dispatch_source_create`, `dispatch_source_set_timer`, `dispatch_resume`,
/// `dispatch_source_cancel`, `dispatch_get_main_queue`) are used as they are. A closure is
/// destroyed on the queue that ran it, right after it has run; what it captures says who keeps whom
/// alive. An exception that leaves a closure ends the process.

/// Runs `initializer` once for each `predicate`, which is static and starts zeroed. Every caller
/// returns after the one run is complete. Any thread.
void dispatch_once(dispatch_once_t* predicate, const std::function<void()>& initializer);

/// Queues `work` and returns at once, also when the caller is on `queue` already. Any thread.
void dispatch_async(dispatch_queue_t queue, std::function<void()> work);

/// Any closure on its way to a queue.
class dispatch_closure {
  public:
    dispatch_closure() = default;
    dispatch_closure(const dispatch_closure&) = delete;
    dispatch_closure& operator=(const dispatch_closure&) = delete;
    virtual ~dispatch_closure() = default;

    virtual void run() = 0;
};

/// The same for what is not null.
void dispatch_async(dispatch_queue_t queue, std::unique_ptr<dispatch_closure> work);

/// The same for whatever can be called, in one piece of memory. It may own what cannot be copied.
template <std::invocable Closure>
void dispatch_async(dispatch_queue_t queue, Closure work) {
    struct Kept final : dispatch_closure {
        explicit Kept(Closure what) : closure(std::move(what)) {}

        void run() override { closure(); }

        Closure closure;
    };

    dispatch_async(queue, std::make_unique<Kept>(std::move(work)));
}

/// Queues `work` when `when` has come; it cannot be taken back. Any thread.
void dispatch_after(dispatch_time_t when, dispatch_queue_t queue, std::function<void()> work);

/// Sets the handler of a source, once for each source and before the source is resumed first. The
/// source owns the handler until the source itself is gone.
void dispatch_source_set_event_handler(dispatch_source_t source, std::function<void()> handler);

/// An owning reference to a dispatch source.
using dispatch_source_ref = std::shared_ptr<std::remove_pointer_t<dispatch_source_t>>;

/// Takes over the reference that `dispatch_source_create` gave; null stays null.
[[nodiscard]] dispatch_source_ref dispatch_take_source(dispatch_source_t source);
