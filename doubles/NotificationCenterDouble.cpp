#include "doubles/NotificationCenterDouble.h"

#include "quorl-script/Naming.h"

namespace quorl {

namespace {

constexpr std::string_view center = "NSNotificationCenter";

/// What holds the resolved playlist beside the preferences. It shows itself to a host only here.
constexpr std::string_view sideObjectClass = "_LMSyncDefaultsAssociatedObject";

} // namespace

void TracingNotificationCenter::addObserver_selector_name_object(NSObject* observer,
                                                                 NSNotificationSelector selector,
                                                                 NSNotificationName name,
                                                                 const NSObject* object) {
    const std::string observerClass = className(*observer);
    trace_->record(center, "addObserver:selector:name:object:", observerClass, selector.name(),
                   name, classNameOrNull(object));
    if (observerClass == sideObjectClass) {
        watchLife(*observer, observerClass, trace_);
    }
    NotificationCenter::addObserver_selector_name_object(observer, selector, name, object);
}

void TracingNotificationCenter::removeObserver(const NSObject* observer) {
    trace_->record(center, "removeObserver:", className(*observer));
    NotificationCenter::removeObserver(observer);
}

void TracingNotificationCenter::postNotificationName_object(NSNotificationName name,
                                                            NSObject* object) {
    trace_->record(center, "postNotificationName:object:", name, classNameOrNull(object));
    NotificationCenter::postNotificationName_object(name, object);
}

} // namespace quorl
