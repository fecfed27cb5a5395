// libdispatch's functions as this program defines them: see VirtualTime.h.

#include <dlfcn.h>

#include "doubles/virtual-time/VirtualTime.h"

namespace {

using quorl::VirtualTime;

/// libdispatch's own function of this name.
template <class Function>
Function* next(const char* name) {
    return reinterpret_cast<Function*>(dlsym(RTLD_NEXT, name));
}

} // namespace

extern "C" {

void dispatch_async_f(dispatch_queue_t queue, void* context, dispatch_function_t work) {
    if (queue == dispatch_get_main_queue()) {
        VirtualTime::shared().async(context, work);
        return;
    }
    static auto* const original = next<decltype(dispatch_async_f)>("dispatch_async_f");
    original(queue, context, work);
}

void dispatch_after_f(dispatch_time_t when, dispatch_queue_t queue, void* context,
                      dispatch_function_t work) {
    VirtualTime::shared().after(when, queue, context, work);
}

dispatch_time_t dispatch_time(dispatch_time_t when, int64_t delta) {
    return VirtualTime::shared().time(when, delta);
}

dispatch_source_t dispatch_source_create(dispatch_source_type_t type, uintptr_t handle,
                                         uintptr_t mask, dispatch_queue_t queue) {
    if (type == DISPATCH_SOURCE_TYPE_TIMER) {
        return VirtualTime::shared().createTimer(queue);
    }
    static auto* const original = next<decltype(dispatch_source_create)>("dispatch_source_create");
    return original(type, handle, mask, queue);
}

void dispatch_source_set_timer(dispatch_source_t source, dispatch_time_t start, uint64_t interval,
                               uint64_t leeway) {
    if (!VirtualTime::shared().setTimer(source, start, interval, leeway)) {
        static auto* const original =
            next<decltype(dispatch_source_set_timer)>("dispatch_source_set_timer");
        original(source, start, interval, leeway);
    }
}

void dispatch_source_set_event_handler_f(dispatch_source_t source, dispatch_function_t handler) {
    if (!VirtualTime::shared().setHandler(source, handler)) {
        static auto* const original = next<decltype(dispatch_source_set_event_handler_f)>(
            "dispatch_source_set_event_handler_f");
        original(source, handler);
    }
}

void dispatch_source_cancel(dispatch_source_t source) {
    if (!VirtualTime::shared().cancel(source)) {
        static auto* const original =
            next<decltype(dispatch_source_cancel)>("dispatch_source_cancel");
        original(source);
    }
}

void dispatch_set_context(dispatch_object_t object, void* context) {
    if (!VirtualTime::shared().setContext(object, context)) {
        static auto* const original = next<decltype(dispatch_set_context)>("dispatch_set_context");
        original(object, context);
    }
}

void dispatch_set_finalizer_f(dispatch_object_t object, dispatch_function_t finalizer) {
    if (!VirtualTime::shared().setFinalizer(object, finalizer)) {
        static auto* const original =
            next<decltype(dispatch_set_finalizer_f)>("dispatch_set_finalizer_f");
        original(object, finalizer);
    }
}

void dispatch_resume(dispatch_object_t object) {
    if (!VirtualTime::shared().resume(object)) {
        static auto* const original = next<decltype(dispatch_resume)>("dispatch_resume");
        original(object);
    }
}

void dispatch_suspend(dispatch_object_t object) {
    if (!VirtualTime::shared().suspend(object)) {
        static auto* const original = next<decltype(dispatch_suspend)>("dispatch_suspend");
        original(object);
    }
}

void dispatch_retain(dispatch_object_t object) {
    if (!VirtualTime::shared().retain(object)) {
        static auto* const original = next<decltype(dispatch_retain)>("dispatch_retain");
        original(object);
    }
}

void dispatch_release(dispatch_object_t object) {
    if (!VirtualTime::shared().release(object)) {
        static auto* const original = next<decltype(dispatch_release)>("dispatch_release");
        original(object);
    }
}

} // extern "C"
