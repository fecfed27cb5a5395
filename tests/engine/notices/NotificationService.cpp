#include "tests/engine/notices/NotificationService.h"

#include <algorithm>
#include <utility>

namespace quorl::syncd::testing {

namespace {

constexpr auto serviceName = "org.freedesktop.Notifications";

/// What answers a call with this value, or with an error.
template <class Value>
std::function<void(NotificationService::Manner)> replyTo(sdbus::Result<Value>&& result,
                                                         const Value& value) {
    return [kept = std::make_shared<sdbus::Result<Value>>(std::move(result)),
            value](NotificationService::Manner manner) {
        if (manner == NotificationService::Manner::Fails) {
            kept->returnError(
                sdbus::Error(std::string(serviceName) + ".Error", "It does not work."));
        } else {
            kept->returnResults(value);
        }
    };
}

} // namespace

NotificationService::NotificationService(std::vector<std::string> abilities)
    : abilities_(std::move(abilities)),
      connection_(sdbus::createSessionBusConnection()),
      object_(sdbus::createObject(*connection_, "/org/freedesktop/Notifications")) {
    registerMethods();
    connection_->requestName(serviceName);
    connection_->enterEventLoopAsync();
}

NotificationService::~NotificationService() { connection_->leaveEventLoop(); }

void NotificationService::registerMethods() {
    object_->registerMethod("GetCapabilities")
        .onInterface(serviceName)
        .implementedAs([this](sdbus::Result<Abilities>&& result) {
            answer(replyTo(std::move(result), abilities_));
            note("ask");
        });
    object_->registerMethod("Notify")
        .onInterface(serviceName)
        .implementedAs([this](sdbus::Result<Number>&& result, std::string app, Number replaced,
                              std::string icon, std::string title, std::string body,
                              std::vector<std::string> actions,
                              std::map<std::string, sdbus::Variant> hints, std::int32_t /*time*/) {
            const auto number = take({replaced, std::move(app), std::move(icon), std::move(title),
                                      std::move(body), std::move(actions), std::move(hints)});
            answer(replyTo(std::move(result), number));
            note("show " + std::to_string(number) +
                 (replaced == 0 ? "" : " for " + std::to_string(replaced)));
        });
    object_->registerMethod("CloseNotification")
        .onInterface(serviceName)
        .implementedAs([this](Number number) { note("close " + std::to_string(number)); });
    object_->finishRegistration();
}

NotificationService::Number NotificationService::take(Notification notification) {
    const std::scoped_lock lock(mutex_);
    shown_ = std::move(notification);
    return ++last_;
}

void NotificationService::note(const std::string& call) {
    const std::scoped_lock lock(mutex_);
    calls_.push_back(call);
    more_.notify_all();
}

void NotificationService::answer(std::function<void(Manner)> reply) {
    const std::scoped_lock lock(mutex_);
    if (manner_ == Manner::KeepsSilent) {
        unanswered_.push_back(std::move(reply));
    } else {
        reply(manner_);
    }
}

void NotificationService::behave(Manner manner) {
    std::vector<std::function<void(Manner)>> answered;
    {
        const std::scoped_lock lock(mutex_);
        manner_ = manner;
        if (manner != Manner::KeepsSilent) {
            answered = std::exchange(unanswered_, {});
        }
    }
    // The bus has a lock of its own, under which calls arrive.
    for (const auto& reply : answered) {
        reply(manner);
    }
}

std::vector<std::string> NotificationService::calls() {
    const std::scoped_lock lock(mutex_);
    return calls_;
}

std::vector<std::string> NotificationService::awaitCalls(std::size_t count) {
    std::unique_lock lock(mutex_);
    more_.wait(lock, [&] { return calls_.size() >= count; });
    return calls_;
}

void NotificationService::awaitCall(const std::string& call) {
    std::unique_lock lock(mutex_);
    more_.wait(lock, [&] { return std::ranges::find(calls_, call) != calls_.end(); });
}

void NotificationService::awaitHeard(const std::string& name) {
    sdbus::createProxy(*connection_, name, "/")
        ->callMethod("Ping")
        .onInterface("org.freedesktop.DBus.Peer");
}

Notification NotificationService::shown() {
    const std::scoped_lock lock(mutex_);
    return shown_;
}

void NotificationService::tell(const std::string& signal, std::uint32_t number,
                               const sdbus::Variant& detail) {
    auto message = object_->createSignal(serviceName, signal);
    message << number;
    if (detail.containsValueOfType<std::string>()) {
        message << detail.get<std::string>();
    } else {
        message << detail.get<std::uint32_t>();
    }
    object_->emitSignal(message);
}

} // namespace quorl::syncd::testing
