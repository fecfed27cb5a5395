#pragma once

#include <QDBusConnection>
#include <QDBusMessage>

#include "quorl/window/desktop/Appearance.h"
#include "quorl/window/look/WindowScreen.h"

namespace quorl {

/// Has the app look as the desktop says, and go on doing so when that changes: asks the desktop's
/// portal for settings, without waiting for it. Where there is no portal, the toolkit alone
/// decides. Main thread.
class DesktopLook final : public QObject {
    Q_OBJECT

  public:
    /// `screen` outlives the look.
    DesktopLook(QDBusConnection bus, WindowScreen& screen);

  private:
    using Settings = QMap<QString, QVariantMap>; ///< by group and key

    /// The portal tells that a setting has changed.
    Q_SLOT void takeChange(const QDBusMessage& news);
    void ask();
    void takeAll(const Settings& settings);
    void show();

    QDBusConnection bus_;
    WindowScreen& screen_;
    const Look usualLook_;
    const QPalette usualPalette_;
    const QFont usualFont_;
    Settings changed_; ///< since the portal was asked
    Appearance appearance_;
    Appearance shown_;
};

} // namespace quorl
