#include "platform/Dispatch.h"

#ifdef __SANITIZE_THREAD__
#include <sanitizer/tsan_interface.h>
#endif

namespace {

using Closure = std::function<void()>;

// The thread sanitizer does not see what libdispatch orders, which is not built with it.
#ifdef __SANITIZE_THREAD__
void releaseForSanitizer(void* what) { __tsan_release(what); }

void acquireForSanitizer(void* what) { __tsan_acquire(what); }
#else
void releaseForSanitizer(void* /*what*/) {}

void acquireForSanitizer(void* /*what*/) {}
#endif

/// What is kept, as the context of a function that another thread may run.
template <class Kept>
void* handedOver(std::unique_ptr<Kept> kept) {
    auto* const context = kept.release();
    releaseForSanitizer(context);
    return context;
}

void runClosure(void* context) noexcept {
    acquireForSanitizer(context);
    const std::unique_ptr<dispatch_closure> closure(static_cast<dispatch_closure*>(context));
    closure->run();
}

void runOnce(void* context) noexcept {
    acquireForSanitizer(context);
    const std::unique_ptr<Closure> closure(static_cast<Closure*>(context));
    (*closure)();
}

void run(void* context) noexcept {
    acquireForSanitizer(context);
    (*static_cast<Closure*>(context))();
}

void destroy(void* context) noexcept { delete static_cast<Closure*>(context); }

struct Initialization {
    dispatch_once_t* once;
    const Closure& work;
};

void initialize(void* context) noexcept {
    const auto& initialization = *static_cast<const Initialization*>(context);
    initialization.work();
    releaseForSanitizer(initialization.once);
}

} // namespace

void dispatch_once(dispatch_once_t* predicate, const std::function<void()>& initializer) {
    Initialization initialization{predicate, initializer};
    dispatch_once_f(predicate, &initialization, initialize);
    acquireForSanitizer(predicate);
}

void dispatch_async(dispatch_queue_t queue, std::function<void()> work) {
    dispatch_async_f(queue, handedOver(std::make_unique<Closure>(std::move(work))), runOnce);
}

void dispatch_async(dispatch_queue_t queue, std::unique_ptr<dispatch_closure> work) {
    dispatch_async_f(queue, handedOver(std::move(work)), runClosure);
}

void dispatch_after(dispatch_time_t when, dispatch_queue_t queue, std::function<void()> work) {
    dispatch_after_f(when, queue, handedOver(std::make_unique<Closure>(std::move(work))), runOnce);
}

void dispatch_source_set_event_handler(dispatch_source_t source, std::function<void()> handler) {
    dispatch_set_context(source, handedOver(std::make_unique<Closure>(std::move(handler))));
    dispatch_set_finalizer_f(source, destroy);
    dispatch_source_set_event_handler_f(source, run);
}

dispatch_source_ref dispatch_take_source(dispatch_source_t source) {
    if (source == nullptr) {
        return nullptr;
    }
    return {source, [](dispatch_source_t owned) { dispatch_release(owned); }};
}
