#include "quorl/window/desktop/ApplicationObject.h"

#include <QDBusArgument>
#include <QDBusConnection>
#include <QDBusMessage>

namespace quorl {

namespace {

const QString interfaceName = QStringLiteral("org.freedesktop.Application");
const QString actionName = QStringLiteral("start");
const QString refusedError = QStringLiteral("org.quorl.Velora.Error.Refused");
const QString tokenKey = QStringLiteral("activation-token");
const QString startupKey = QStringLiteral("desktop-startup-id");
const QString musicKey = QStringLiteral("music");
const QString wearableKey = QStringLiteral("wearable");
const QString pluginsKey = QStringLiteral("plugins");

/// Paths are bytes: not every one is a text.
QByteArray bytesOf(const std::filesystem::path& path) {
    return QByteArray::fromStdString(path.native());
}

std::filesystem::path pathIn(const QVariantMap& values, const QString& key) {
    return values.value(key).toByteArray().toStdString();
}

QByteArray tokenIn(const QVariantMap& platform) {
    const QByteArray token = platform.value(tokenKey).toString().toUtf8();
    return token.isEmpty() ? platform.value(startupKey).toString().toUtf8() : token;
}

Places placesIn(const QVariant& parameters) {
    const auto list = qdbus_cast<QVariantList>(parameters);
    const auto values = list.isEmpty() ? QVariantMap() : qdbus_cast<QVariantMap>(list.front());
    return {pathIn(values, musicKey), pathIn(values, wearableKey), pathIn(values, pluginsKey)};
}

/// What a call of the interface asks for; nothing for a call that the interface does not have.
std::optional<Start> startIn(const QDBusMessage& message) {
    const QString signature = message.signature();
    const QVariantList arguments = message.arguments();
    if ((message.member() == QStringLiteral("Activate") && signature == QStringLiteral("a{sv}")) ||
        (message.member() == QStringLiteral("Open") && signature == QStringLiteral("asa{sv}"))) {
        return Start{{}, tokenIn(qdbus_cast<QVariantMap>(arguments.back()))};
    }
    if (message.member() == QStringLiteral("ActivateAction") &&
        signature == QStringLiteral("sava{sv}") && arguments.front() == actionName) {
        return Start{placesIn(arguments[1]), tokenIn(qdbus_cast<QVariantMap>(arguments.back()))};
    }
    return std::nullopt;
}

} // namespace

QDBusMessage ApplicationObject::callWith(const Start& start, const QString& name) {
    auto call = QDBusMessage::createMethodCall(name, pathFor(name), interfaceName,
                                               QStringLiteral("ActivateAction"));
    const QVariantMap places{{musicKey, bytesOf(start.places.music)},
                             {wearableKey, bytesOf(start.places.wearable)},
                             {pluginsKey, bytesOf(start.places.plugins)}};
    QVariantMap platform;
    if (!start.token.isEmpty()) {
        platform.insert(tokenKey, QString::fromUtf8(start.token));
        platform.insert(startupKey, QString::fromUtf8(start.token));
    }
    call.setArguments({actionName, QVariantList{places}, platform});
    call.setAutoStartService(false);
    return call;
}

QString ApplicationObject::pathFor(QString name) { return u'/' + name.replace(u'.', u'/'); }

QString ApplicationObject::introspect(const QString& /*path*/) const {
    return QStringLiteral(R"(<interface name="org.freedesktop.Application">
  <method name="Activate">
    <arg type="a{sv}" name="platform_data" direction="in"/>
  </method>
  <method name="Open">
    <arg type="as" name="uris" direction="in"/>
    <arg type="a{sv}" name="platform_data" direction="in"/>
  </method>
  <method name="ActivateAction">
    <arg type="s" name="action_name" direction="in"/>
    <arg type="av" name="parameter" direction="in"/>
    <arg type="a{sv}" name="platform_data" direction="in"/>
  </method>
</interface>
)");
}

bool ApplicationObject::handleMessage(const QDBusMessage& message, const QDBusConnection& bus) {
    const auto start =
        message.interface() == interfaceName ? startIn(message) : std::optional<Start>();
    if (!start) {
        return false;
    }
    const QString problem = take_ ? take_(*start) : QString();
    return bus.send(problem.isEmpty() ? message.createReply()
                                      : message.createErrorReply(refusedError, problem));
}

} // namespace quorl
