#include "runtime/host/Host.h"

#include <chrono>
#include <cstdio>
#include <cstdlib>

#include "runtime/objects/NotificationCenter.h"
#include "runtime/plugins/StringTable.h"
#include "runtime/services/SizeText.h"

namespace quorl {

namespace {

/// Never destroyed: panes and process-wide objects of plug-ins may outlive `main`.
std::shared_ptr<Host>& installed() {
    static auto* const host = new std::shared_ptr<Host>;
    return *host;
}

NSNotificationCenter& processWideNotificationCenter() {
    static auto* const center =
        new std::shared_ptr<NotificationCenter>(::create<NotificationCenter>());
    return **center;
}

} // namespace

void Host::install(std::shared_ptr<Host> host) { installed() = std::move(host); }

Host* Host::current() { return installed().get(); }

Host& Host::required() {
    if (!current()) {
        std::fputs("quorl: a pane was used before a host was installed\n", stderr);
        std::abort();
    }
    return *current();
}

std::shared_ptr<PSSpecifier> Host::glanceSpecifier(const std::string& /*identifier*/) {
    return nullptr;
}

NSNotificationCenter& Host::notificationCenter() { return processWideNotificationCenter(); }

double Host::secondsSince1970() {
    return std::chrono::duration<double>(std::chrono::system_clock::now().time_since_epoch())
        .count();
}

std::vector<std::string> Host::languages() { return environmentLanguages(); }

std::optional<std::string> Host::textForKey(const StringTable& table, const std::string& key,
                                            const std::optional<std::string>& /*value*/) {
    return table.text(languages(), StringTable::defaultDomain, key);
}

std::string Host::sizeText(float bytes) {
    return quorl::sizeText(static_cast<double>(bytes), languages().front());
}

} // namespace quorl

using quorl::Host;

NSNotificationCenter& NSNotificationCenter::defaultCenter() {
    return Host::current() ? Host::current()->notificationCenter()
                           : quorl::processWideNotificationCenter();
}

std::shared_ptr<NSDate> NSDate::date() {
    return std::make_shared<NSDate>(Host::required().secondsSince1970());
}

double NSDate::timeIntervalSinceDate(const NSDate& earlier) const {
    return _seconds - earlier._seconds;
}

LMSyncDefaults& LMSyncDefaults::sharedDefaults() { return Host::required().syncDefaults(); }

NSArray<DVSession> DVSession::sessionsWithSessionTypeIdentifier(const std::string& type) {
    return Host::required().sessions(type);
}
