#include "quorl/window/desktop/OneApp.h"

#include <QCoreApplication>
#include <QDBusConnectionInterface>
#include <QDBusError>
#include <QDBusMessage>

namespace quorl {

namespace {

QString nameFor(base::Purpose purpose) {
    return purpose == base::Purpose::Trial ? QStringLiteral("org.quorl.Velora.Trial")
                                           : QStringLiteral("org.quorl.Velora");
}

QString problemOf(const QDBusMessage& reply) {
    const bool isSilent = QDBusError(reply).type() == QDBusError::NoReply;
    return isSilent ? QCoreApplication::translate(
                          "OneApp", "quorl is running already, but does not answer. End it, then "
                                    "start it again.")
                    : reply.errorMessage();
}

} // namespace

OneApp::OneApp(QDBusConnection bus, base::Purpose purpose, std::chrono::milliseconds patience)
    : bus_(std::move(bus)), name_(nameFor(purpose)), patience_(patience) {
    // Before the name is owned, so that nobody finds the name without the object.
    bus_.registerVirtualObject(ApplicationObject::pathFor(name_), &object_,
                               QDBusConnection::SingleNode);
}

OneApp::~OneApp() {
    if (bus_.isConnected()) {
        bus_.unregisterService(name_); // crashes without a bus
    }
    bus_.unregisterObject(ApplicationObject::pathFor(name_));
}

bool OneApp::own() {
    const auto answer =
        bus_.interface()->registerService(name_, QDBusConnectionInterface::DontQueueService);
    return answer.isValid() && answer.value() == QDBusConnectionInterface::ServiceRegistered;
}

std::optional<QString> OneApp::handOver(const Start& start) {
    if (!bus_.isConnected() || own()) {
        return std::nullopt;
    }
    const auto call = ApplicationObject::callWith(start, name_);
    const auto reply = bus_.call(call, QDBus::Block, static_cast<int>(patience_.count()));
    if (reply.type() == QDBusMessage::ReplyMessage) {
        return QString();
    }
    const bool isLeft = own(); // the first one has just ended
    return isLeft ? std::nullopt : std::optional(problemOf(reply));
}

} // namespace quorl
