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
    auto& registrations = registrations_[name];
    auto more = registrations ? std::make_shared<Registrations>(*registrations)
                              : std::make_shared<Registrations>();
    more->insert(more->begin(), std::make_shared<Registration>(*observer, selector, object));
    registrations = std::move(more);
}

void NotificationCenter::removeObserver(const NSObject* observer) {
    const auto isOthers = [observer](const std::shared_ptr<Registration>& registration) {
        return registration->observer != observer;
    };
    const std::lock_guard lock(mutex_);
    for (auto& [name, registrations] : registrations_) {
        auto others = std::make_shared<Registrations>(*registrations);
        const auto theirs = std::stable_partition(others->begin(), others->end(), isOthers);
        std::for_each(theirs, others->end(),
                      [](const auto& registration) { registration->removed = true; });
        others->erase(theirs, others->end());
        registrations = std::move(others);
    }
}

void NotificationCenter::postNotificationName_object(NSNotificationName name, NSObject* object) {
    const auto registrations = registrationsFor(name);
    const NSNotification notification{name, object};
    for (const auto& registration : *registrations) {
        if (registration->sender == nullptr || registration->sender == object) {
            if (const auto observer = observerOf(*registration)) {
                registration->selector(*observer, notification);
            }
        }
    }
}

/// The observer, kept alive for its call, unless it has left since the post began.
std::shared_ptr<NSObject> NotificationCenter::observerOf(const Registration& registration) {
    return registration.removed ? nullptr : registration.reference.lock();
}

std::shared_ptr<const NotificationCenter::Registrations>
NotificationCenter::registrationsFor(NSNotificationName name) {
    static const auto none = std::make_shared<const Registrations>();
    const std::lock_guard lock(mutex_);
    const auto found = registrations_.find(name);
    return found == registrations_.end() ? none : found->second;
}

} // namespace quorl
