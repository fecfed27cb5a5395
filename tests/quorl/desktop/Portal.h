#pragma once

#include <QColor>
#include <QDBusVirtualObject>
#include <QVariant>

#include "tests/quorl/desktop/OtherConnection.h"

namespace quorl::tests {

/// Stands in for the desktop's portal on the session bus, with settings that a test chooses.
class Portal final : public QDBusVirtualObject {
  public:
    /// A silent one never answers.
    enum class Manner { Answering, Silent };

    explicit Portal(Manner manner = Manner::Answering);

    static constexpr auto appearance = "org.freedesktop.appearance";
    static constexpr auto interface = "org.gnome.desktop.interface";
    static constexpr auto windows = "org.gnome.desktop.wm.preferences";

    /// Changes a setting, and tells so.
    void set(const char* group, const char* key, const QVariant& value);

    /// A colour as the portal writes it: three numbers from 0 to 1.
    [[nodiscard]] static QVariant color(double red, double green, double blue);

    [[nodiscard]] QString introspect(const QString& path) const override;
    bool handleMessage(const QDBusMessage& message, const QDBusConnection& bus) override;

  private:
    const Manner manner_;
    QMap<QString, QVariantMap> settings_;
    OtherConnection connection_ = OtherConnection("portal");
};

} // namespace quorl::tests
