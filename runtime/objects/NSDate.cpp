#include "platform/NSDate.h"

#include "runtime/host/Host.h"

std::shared_ptr<NSDate> NSDate::date() {
    return std::make_shared<NSDate>(quorl::Host::required().secondsSince1970());
}

double NSDate::timeIntervalSinceDate(const NSDate& earlier) const {
    return _seconds - earlier._seconds;
}
