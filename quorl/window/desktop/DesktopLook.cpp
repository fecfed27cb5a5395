#include "quorl/window/desktop/DesktopLook.h"

#include <QApplication>
#include <QDBusArgument>
#include <QDBusMessage>
#include <QDBusMetaType>
#include <QDBusPendingCallWatcher>
#include <QDBusPendingReply>
#include <QDBusServiceWatcher>

namespace quorl {

namespace {

using Settings = QMap<QString, QVariantMap>;

const QString portalName = QStringLiteral("org.freedesktop.portal.Desktop");
const QString portalPath = QStringLiteral("/org/freedesktop/portal/desktop");
const QString settingsInterface = QStringLiteral("org.freedesktop.portal.Settings");

QDBusMessage question() {
    auto call = QDBusMessage::createMethodCall(portalName, portalPath, settingsInterface,
                                               QStringLiteral("ReadAll"));
    call.setArguments({QStringList{QStringLiteral("org.freedesktop.appearance"),
                                   QStringLiteral("org.gnome.desktop.interface")}});
    return call;
}

} // namespace

DesktopLook::DesktopLook(QDBusConnection bus, WindowScreen& screen)
    : bus_(std::move(bus)),
      screen_(screen),
      usualLook_(screen.look()),
      usualPalette_(QApplication::palette()),
      usualFont_(QApplication::font()) {
    qDBusRegisterMetaType<Settings>();
    // Before the question, so that no change falls in between.
    bus_.connect(portalName, portalPath, settingsInterface, QStringLiteral("SettingChanged"), this,
                 SLOT(takeChange(QString, QString, QDBusVariant)));
    auto* portal =
        new QDBusServiceWatcher(portalName, bus_, QDBusServiceWatcher::WatchForRegistration, this);
    connect(portal, &QDBusServiceWatcher::serviceRegistered, this, &DesktopLook::ask);
    ask();
}

void DesktopLook::ask() {
    auto* answer = new QDBusPendingCallWatcher(bus_.asyncCall(question()), this);
    connect(answer, &QDBusPendingCallWatcher::finished, this, [this, answer] {
        const QDBusPendingReply<Settings> reply = *answer;
        answer->deleteLater();
        if (reply.isError()) {
            return; // there is no portal, or it knows no settings: as without one
        }
        const Settings settings = reply.value();
        appearance_ = {};
        for (auto group = settings.begin(); group != settings.end(); ++group) {
            for (auto value = group->begin(); value != group->end(); ++value) {
                appearance_.take(group.key(), value.key(), value.value());
            }
        }
        show();
    });
}

void DesktopLook::takeChange(const QString& group, const QString& key, const QDBusVariant& value) {
    appearance_.take(group, key, value.variant());
    show();
}

void DesktopLook::show() {
    Appearance now = appearance_;
    if (QGuiApplication::platformName() == QStringLiteral("xcb")) {
        now.textScale = 1; // it is in the resolution that X11 tells
    }
    if (now == shown_) {
        return;
    }
    shown_ = now;
    screen_.setLook(now.look(usualLook_));
    QApplication::setPalette(now.palette(usualPalette_));
    QApplication::setFont(now.font(usualFont_));
}

} // namespace quorl
