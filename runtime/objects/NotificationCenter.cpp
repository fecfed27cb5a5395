#include "runtime/objects/NotificationCenter.h"

#include <algorithm>

namespace quorl {

NotificationCenter& NotificationCenter::processWide() {
    static auto* const center =
        new std::shared_ptr<NotificationCenter>(create<NotificationCenter>()); // never destroyed
    return **center;
}

void NotificationCenter::addObserver_selector_name_object(NSObject* observer,
                                                          NSNotificationSelector selector,
                                                          NSNotificationName name,
                                                          const NSObject* object) {
    const std::lock_guard lock(mutex_);
    registrations_[name].push_back(std::make_shared<Registration>(
        Registration{observer, observer->weak_from_this(), selector, object}));
}

void NotificationCenter::removeObserver(const NSObject* observer) {
    const std::lock_guard lock(mutex_);
    for (auto& [name, registrations] : registrations_) {
        std::erase_if(registrations, [observer](const std::shared_ptr<Registration>& registration) {
            const bool leaves = registration->observer == observer;
            registration->removed = registration->removed || leaves;
            return leaves;
        });
    }
}

void NotificationCenter::postNotificationName_object(NSNotificationName name, NSObject* object) {
    const NSNotification notification{name, object};
    for (const auto& registration : registrationsFor(name, object)) {
        if (const auto observer = observerOf(*registration)) {
            registration->selector(*observer, notification);
        }
    }
}

NotificationCenter::Registrations NotificationCenter::registrationsFor(NSNotificationName name,
                                                                       const NSObject* sender) {
    const std::lock_guard lock(mutex_);
    Registrations matching;
    if (const auto found = registrations_.find(name); found != registrations_.end()) {
        std::copy_if(found->second.rbegin(), found->second.rend(), std::back_inserter(matching),
                     [sender](const std::shared_ptr<Registration>& registration) {
                         return registration->sender == nullptr || registration->sender == sender;
                     });
    }
    return matching;
}

/// The observer, kept alive for its call, unless it has left since the post began.
std::shared_ptr<NSObject> NotificationCenter::observerOf(const Registration& registration) {
    const std::lock_guard lock(mutex_);
    return registration.removed ? nullptr : registration.reference.lock();
}

} // namespace quorl
