#include "quorl-syncd/bus/SleepInhibitor.h"

#include <chrono>
#include <string>

#include "services/language/Translated.h"
#include "services/wearable/Wearable.h"

namespace quorl::syncd {

namespace {

constexpr auto loginManager = "org.freedesktop.login1";
constexpr std::chrono::seconds patience{2};

} // namespace

SleepInhibitor::SleepInhibitor() {
    try {
        const auto bus = sdbus::createSystemBusConnection();
        const auto manager = sdbus::createProxy(*bus, loginManager, "/org/freedesktop/login1");
        manager->callMethod("Inhibit")
            .onInterface("org.freedesktop.login1.Manager")
            .withTimeout(patience)
            .withArguments(
                "sleep", "quorl-syncd",
                language::filled(language::translated("Music is being synced to the {wearable}"),
                                 {{"wearable", wearable::wearableName}}),
                "block")
            .storeResultsTo(lock_);
    } catch (const sdbus::Error&) {
        // A machine without a login manager does not put itself to sleep.
    }
}

} // namespace quorl::syncd
