#include "quorl/window/desktop/DesktopLook.h"

#include <QApplication>
#include <QDBusArgument>
#include <QDBusMetaType>
#include <QDBusPendingCallWatcher>
#include <QDBusPendingReply>
#include <QDBusServiceWatcher>
#include <QDBusVariant>

namespace quorl {

namespace {

const QString portalName = QStringLiteral("org.freedesktop.portal.Desktop");
const QString portalPath = QStringLiteral("/org/freedesktop/portal/desktop");
const QString settingsInterface = QStringLiteral("org.freedesktop.portal.Settings");

QDBusMessage question() {
    auto call = QDBusMessage::createMethodCall(portalName, portalPath, settingsInterface,
                                               QStringLiteral("ReadAll"));
    call.setArguments({QStringList{QStringLiteral("org.freedesktop.appearance"),
                                   QStringLiteral("org.gnome.desktop.interface"),
                                   QStringLiteral("org.gnome.desktop.wm.preferences")}});
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
                 SLOT(takeChange(QDBusMessage)));
    auto* portal =
        new QDBusServiceWatcher(portalName, bus_, QDBusServiceWatcher::WatchForRegistration, this);
    connect(portal, &QDBusServiceWatcher::serviceRegistered, this, &DesktopLook::ask);
    ask();
}

void DesktopLook::ask() {
    changed_.clear();
    auto* answer = new QDBusPendingCallWatcher(bus_.asyncCall(question()), this);
    connect(answer, &QDBusPendingCallWatcher::finished, this, [this, answer] {
        const QDBusPendingReply<Settings> reply = *answer;
        answer->deleteLater();
        if (reply.isError()) {
            return; // there is no portal, or it knows no settings: as without one
        }
        appearance_ = {};
        takeAll(reply.value());
        takeAll(changed_); // Qt may bring the answer after changes that were told later
        show();
    });
}

void DesktopLook::takeAll(const Settings& settings) {
    for (auto group = settings.begin(); group != settings.end(); ++group) {
        for (auto value = group->begin(); value != group->end(); ++value) {
            appearance_.take(group.key(), value.key(), value.value());
        }
    }
}

void DesktopLook::takeChange(const QDBusMessage& news) {
    if (news.signature() != QStringLiteral("ssv")) {
        return; // no setting that a portal tells of
    }
    const QVariantList told = news.arguments();
    const QVariant value = told[2].value<QDBusVariant>().variant();
    changed_[told[0].toString()].insert(told[1].toString(), value);
    appearance_.take(told[0].toString(), told[1].toString(), value);
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
