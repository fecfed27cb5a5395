#pragma once

#include <QDBusConnection>
#include <QDBusMessage>
#include <QVariant>

namespace quorl::tests {

/// A connection to the session bus beside the app's own, as another program has one.
class OtherConnection {
  public:
    /// `name` tells it from others of this process.
    explicit OtherConnection(const char* name);
    ~OtherConnection();

    OtherConnection(const OtherConnection&) = delete;
    OtherConnection& operator=(const OtherConnection&) = delete;

    [[nodiscard]] QDBusConnection bus() const { return bus_; }

    /// Calls a method of org.freedesktop.Application of the app that owns `owner`, and runs the
    /// event loop until there is an answer.
    [[nodiscard]] QDBusMessage callApplication(const QString& owner, const char* method,
                                               const QVariantList& arguments) const;

  private:
    const QString name_;
    QDBusConnection bus_;
};

/// Runs the event loop until some program owns the name on the session bus, or none does.
void waitForOwner(const QString& name, bool isThere);

/// Runs the event loop until the app that owns the name, or is about to, serves its window.
void waitForWindow(const QString& name);

} // namespace quorl::tests
