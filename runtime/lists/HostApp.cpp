#include "platform/HostApp.h"

#include "runtime/host/Host.h"
#include "runtime/host/Screen.h"

std::shared_ptr<NSBundle> QPSNotificationAppController::bundle() {
    return NSBundle::bundleForClass(Class::ofObject(*this));
}

std::optional<std::string> QPSNotificationAppController::applicationBundleIdentifier() {
    return bundle()->bundleIdentifier();
}

std::shared_ptr<PSSpecifier>
QPSNotificationAppController::glanceSpecifierForIdentifier(const std::string& identifier) {
    return quorl::Host::required().glanceSpecifier(identifier);
}

UIColor QPSQuorlTintColor() { return quorl::Host::required().screen().tintColor(); }
