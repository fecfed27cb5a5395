#include "platform/NSNotificationCenter.h"

#include "runtime/host/Host.h"
#include "runtime/objects/NotificationCenter.h"

using quorl::Host;

NSNotificationCenter& NSNotificationCenter::defaultCenter() {
    return Host::current() ? Host::current()->notificationCenter()
                           : quorl::NotificationCenter::processWide();
}
