#include "quorl-syncd/bus/DesktopNotices.h"

#include <algorithm>
#include <iostream>
#include <map>
#include <string_view>
#include <utility>

#include "services/base/Utf8.h"
#include "services/engine/Codes.h"
#include "services/language/Translated.h"

namespace quorl::syncd {

namespace {

using Kind = DesktopNotice::Kind;
using Values = std::map<std::string, sdbus::Variant>;

constexpr auto serviceName = "org.freedesktop.Notifications";
constexpr auto servicePath = "/org/freedesktop/Notifications";

/// The app's name on the bus, and that of its desktop entry and its icon.
constexpr auto appID = "org.quorl.Velora";
constexpr auto appPath = "/org/quorl/Velora";
constexpr auto appName = "Velora";

/// What a click on the notice itself is called.
constexpr auto defaultAction = "default";

/// As long as the desktop likes.
constexpr std::int32_t usualTime = -1;

enum Urgency : std::uint8_t { Low = 0, Normal = 1 };

std::string signalsOf(const char* sender) {
    return std::string("type='signal',sender='") + sender + "'";
}

std::string escaped(const std::string& text) {
    std::string result;
    for (const char letter : text) {
        result += letter == '&'   ? "&amp;"
                  : letter == '<' ? "&lt;"
                  : letter == '>' ? "&gt;"
                                  : std::string(1, letter);
    }
    return result;
}

bool has(const std::vector<std::string>& abilities, std::string_view ability) {
    return std::ranges::find(abilities, ability) != abilities.end();
}

void complain(const std::string& pattern, const sdbus::Error& error) {
    std::cerr << "quorl-syncd: "
              << language::filled(pattern, {{"reason", base::printable(error.getMessage())}})
              << '\n';
}

std::string titleOf(Kind kind) {
    return engine::sentence(
        {kind == Kind::Done ? engine::code::titleSynced : engine::code::titleNotSynced, {}});
}

Values hintsFor(Kind kind) {
    const bool isDone = kind == Kind::Done;
    return {
        {"desktop-entry", sdbus::Variant(std::string(appID))},
        {"category", sdbus::Variant(std::string(isDone ? "transfer.complete" : "transfer.error"))},
        {"urgency", sdbus::Variant(static_cast<std::uint8_t>(isDone ? Low : Normal))}};
}

} // namespace

DesktopNotices::DesktopNotices(sdbus::IConnection& bus)
    : service_(sdbus::createProxy(bus, serviceName, servicePath)),
      app_(sdbus::createProxy(bus, appID, appPath)),
      signals_(bus.addMatch(signalsOf(serviceName) + ",path='" + servicePath + "'",
                            [this](sdbus::Message& signal) { hear(signal); })),
      // Another service has other notices under the same numbers.
      owners_(bus.addMatch(signalsOf("org.freedesktop.DBus") + ",member='NameOwnerChanged',arg0='" +
                               serviceName + "'",
                           [this](sdbus::Message& /*signal*/) { shown_ = 0; })) {}

DesktopNotices::~DesktopNotices() {
    try {
        close();
    } catch (const sdbus::Error&) {
        // There is no bus any more, and no notice.
    }
}

void DesktopNotices::show(const DesktopNotice& notice) {
    wanted_ = notice;
    isSettled_ = false;
    settle();
}

void DesktopNotices::withdraw() {
    wanted_.reset();
    isSettled_ = false;
    settle();
}

/// One after the other, so that there is never more than one notice.
void DesktopNotices::settle() {
    if (isSettled_ || isUnderWay_) {
        return;
    }
    if (wanted_) {
        ask();
    } else {
        isSettled_ = true;
        close();
    }
}

void DesktopNotices::ask() {
    isUnderWay_ = true;
    isSettled_ = true;
    service_->callMethodAsync("GetCapabilities")
        .onInterface(serviceName)
        .uponReplyInvoke([this](const sdbus::Error* error, const Abilities& abilities) {
            noteAnswer(error);
            if (error == nullptr && wanted_) {
                send(abilities);
            } else {
                settle();
            }
        });
}

void DesktopNotices::send(const Abilities& abilities) {
    isUnderWay_ = true;
    isSettled_ = true;
    const auto body = base::validUtf8(engine::sentence(wanted_->message));
    const auto actions = has(abilities, "actions")
                             ? std::vector<std::string>{defaultAction, language::translated("Open")}
                             : std::vector<std::string>();
    service_->callMethodAsync("Notify")
        .onInterface(serviceName)
        .withArguments(std::string(appName), shown_, std::string(appID), titleOf(wanted_->kind),
                       has(abilities, "body-markup") ? escaped(body) : body, actions,
                       hintsFor(wanted_->kind), usualTime)
        .uponReplyInvoke([this](const sdbus::Error* error, const Number& number) {
            shown_ = error == nullptr ? number : shown_;
            noteAnswer(error);
            settle();
        });
}

/// Its answer says nothing: where it fails, the notice was gone already.
void DesktopNotices::close() {
    if (shown_ != 0) {
        service_->callMethod("CloseNotification")
            .onInterface(serviceName)
            .withArguments(shown_)
            .dontExpectReply();
        shown_ = 0;
    }
}

void DesktopNotices::noteAnswer(const sdbus::Error* error) {
    isUnderWay_ = false;
    if (error != nullptr && !isProblemTold_) {
        isProblemTold_ = true;
        complain(language::translated("Nothing can be told on the desktop ({reason})."), *error);
    }
}

void DesktopNotices::hear(sdbus::Message& signal) {
    try {
        const auto member = signal.getMemberName();
        Number number = 0;
        signal >> number;
        if (number == 0 || number != shown_) {
            return;
        }
        if (member == "NotificationClosed") {
            shown_ = 0;
        } else if (member == "ActivationToken") {
            signal >> token_;
        } else if (member == "ActionInvoked") {
            openApp(); // the one action that there is
        }
    } catch (const sdbus::Error&) {
        // It is not as the service promises; what was meant cannot be known.
    }
}

void DesktopNotices::openApp() {
    Values platform;
    if (!token_.empty()) {
        platform["activation-token"] = sdbus::Variant(std::exchange(token_, {}));
    }
    app_->callMethodAsync("Activate")
        .onInterface("org.freedesktop.Application")
        .withArguments(platform)
        .uponReplyInvoke([](const sdbus::Error* error) {
            if (error != nullptr) {
                complain(language::translated("The app cannot be opened ({reason})."), *error);
            }
        });
}

} // namespace quorl::syncd
