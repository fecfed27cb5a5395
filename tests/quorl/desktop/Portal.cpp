#include "tests/quorl/desktop/Portal.h"

#include <QDBusArgument>
#include <QDBusMessage>
#include <QDBusMetaType>
#include <stdexcept>

namespace quorl::tests {

namespace {

const QString path = QStringLiteral("/org/freedesktop/portal/desktop");
const QString settingsInterface = QStringLiteral("org.freedesktop.portal.Settings");

} // namespace

Portal::Portal(Manner manner) : manner_(manner) {
    qDBusRegisterMetaType<QMap<QString, QVariantMap>>();
    auto bus = connection_.bus();
    if (!bus.registerVirtualObject(path, this) ||
        !bus.registerService(QStringLiteral("org.freedesktop.portal.Desktop"))) {
        throw std::runtime_error("there is a portal already");
    }
}

void Portal::set(const char* group, const char* key, const QVariant& value) {
    settings_[QString::fromLatin1(group)].insert(QString::fromLatin1(key), value);
    auto news =
        QDBusMessage::createSignal(path, settingsInterface, QStringLiteral("SettingChanged"));
    news.setArguments({QString::fromLatin1(group), QString::fromLatin1(key),
                       QVariant::fromValue(QDBusVariant(value))});
    connection_.bus().send(news);
}

QVariant Portal::color(double red, double green, double blue) {
    QDBusArgument color;
    color.beginStructure();
    color << red << green << blue;
    color.endStructure();
    return QVariant::fromValue(color);
}

QString Portal::introspect(const QString& /*path*/) const { return {}; }

bool Portal::handleMessage(const QDBusMessage& message, const QDBusConnection& bus) {
    if (message.member() != QStringLiteral("ReadAll") || manner_ == Manner::Silent) {
        return message.member() == QStringLiteral("ReadAll");
    }
    return bus.send(message.createReply(QVariant::fromValue(settings_)));
}

} // namespace quorl::tests
