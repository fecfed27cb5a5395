#pragma once

#include <QDBusVirtualObject>
#include <functional>

#include "quorl/window/desktop/Start.h"

namespace quorl {

/// The app as desktops and later starts of it see it on the session bus: the interface
/// org.freedesktop.Application, with one action of our own, by which a start is handed over whole.
/// Main thread.
class ApplicationObject final : public QDBusVirtualObject {
    Q_OBJECT

  public:
    /// Takes a start. Gives back a sentence for the person who started where it cannot be taken;
    /// empty where it was.
    using Take = std::function<QString(const Start& start)>;

    void setTake(Take take) { take_ = std::move(take); }

    /// The call by which `start` is handed over to the app that owns `name`.
    [[nodiscard]] static QDBusMessage callWith(const Start& start, const QString& name);

    /// Where the app that owns `name` has this object.
    [[nodiscard]] static QString pathFor(QString name);

    [[nodiscard]] QString introspect(const QString& path) const override;
    bool handleMessage(const QDBusMessage& message, const QDBusConnection& bus) override;

  private:
    Take take_;
};

} // namespace quorl
