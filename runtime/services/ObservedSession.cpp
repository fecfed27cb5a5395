#include "runtime/services/ObservedSession.h"

#include <algorithm>

namespace quorl {

void ObservedSession::addObserver(const std::shared_ptr<DVSessionObserver>& observer) {
    const std::lock_guard lock(mutex_);
    const bool isAttached =
        std::any_of(observers_.begin(), observers_.end(),
                    [&observer](const auto& attached) { return attached.lock() == observer; });
    if (!isAttached) {
        observers_.push_back(observer);
    }
}

void ObservedSession::removeObserver(const std::shared_ptr<DVSessionObserver>& observer) {
    const std::lock_guard lock(mutex_);
    std::erase_if(observers_, [&observer](const std::weak_ptr<DVSessionObserver>& attached) {
        return attached.expired() || attached.lock() == observer;
    });
}

void ObservedSession::tellObservers(const std::function<void(DVSessionObserver&)>& call) const {
    std::vector<std::weak_ptr<DVSessionObserver>> attached;
    {
        const std::lock_guard lock(mutex_);
        attached = observers_;
    }
    for (const auto& reference : attached) {
        if (const auto observer = reference.lock()) {
            call(*observer);
        }
    }
}

} // namespace quorl
