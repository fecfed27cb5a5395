#include "tests/quorl/desktop/OtherConnection.h"

#include <QDBusConnectionInterface>
#include <QDBusPendingCall>
#include <QTest>
#include <stdexcept>

#include "quorl/window/desktop/ApplicationObject.h"

namespace quorl::tests {

namespace {

constexpr int patience = 60'000; // milliseconds

} // namespace

OtherConnection::OtherConnection(const char* name)
    : name_(QString::fromLatin1(name)),
      bus_(QDBusConnection::connectToBus(QDBusConnection::SessionBus, name_)) {}

OtherConnection::~OtherConnection() { QDBusConnection::disconnectFromBus(name_); }

QDBusMessage OtherConnection::callApplication(const QString& owner, const char* method,
                                              const QVariantList& arguments) const {
    auto call = QDBusMessage::createMethodCall(owner, ApplicationObject::pathFor(owner),
                                               QStringLiteral("org.freedesktop.Application"),
                                               QString::fromLatin1(method));
    call.setArguments(arguments);
    const auto pending = bus_.asyncCall(call);
    if (!QTest::qWaitFor([&pending] { return pending.isFinished(); }, patience)) {
        throw std::runtime_error("no answer on the bus");
    }
    return pending.reply();
}

void waitForOwner(const QString& name, bool isThere) {
    auto* bus = QDBusConnection::sessionBus().interface();
    if (!QTest::qWaitFor([&] { return bus->isServiceRegistered(name).value() == isThere; },
                         patience)) {
        throw std::runtime_error(name.toStdString() + (isThere ? " does not come" : " stays"));
    }
}

void waitForWindow(const QString& name) {
    waitForOwner(name, true);
    // Answered from the event loop, which runs when the window is shown.
    (void)OtherConnection("desktop").callApplication(name, "Activate", {QVariantMap()});
}

} // namespace quorl::tests
