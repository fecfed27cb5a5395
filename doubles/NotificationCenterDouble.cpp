#include "doubles/NotificationCenterDouble.h"

namespace quorl {

void NotificationCenterDouble::addObserver_selector_name_object(NSObject* observer,
                                                                NSNotificationSelector selector,
                                                                NSNotificationName name,
                                                                const NSObject* object) {
    recorder_->centerWillAddObserver(*observer, selector, name, object);
    NotificationCenter::addObserver_selector_name_object(observer, selector, name, object);
}

void NotificationCenterDouble::removeObserver(const NSObject* observer) {
    recorder_->centerWillRemoveObserver(*observer);
    NotificationCenter::removeObserver(observer);
}

void NotificationCenterDouble::postNotificationName_object(NSNotificationName name,
                                                           NSObject* object) {
    recorder_->centerWillPost(name, object);
    NotificationCenter::postNotificationName_object(name, object);
}

} // namespace quorl
