#pragma once

#include <QDBusConnection>
#include <chrono>

#include "quorl/window/desktop/ApplicationObject.h"

namespace quorl {

/// Keeps a session to one window of the app, and to one more for a trial: the first start owns a
/// name on the session bus, and later ones hand over to it what they bring. Main thread.
class OneApp final {
  public:
    static constexpr std::chrono::seconds usualPatience{15};

    /// A first app that does not answer for so long is taken to hang rather than to be starting.
    OneApp(QDBusConnection bus, base::Purpose purpose,
           std::chrono::milliseconds patience = usualPatience);

    /// Gives the name back.
    ~OneApp();

    OneApp(const OneApp&) = delete;
    OneApp& operator=(const OneApp&) = delete;

    /// Hands `start` over to the first app. Nothing where this is the first one from now on, as
    /// every one is where there is no bus; else a sentence for the person who started says why the
    /// first one has not taken it, and is empty where it has.
    [[nodiscard]] std::optional<QString> handOver(const Start& start);

    /// `take` is called with each start that is handed over to this app.
    void setTake(ApplicationObject::Take take) { object_.setTake(std::move(take)); }

  private:
    [[nodiscard]] bool own();

    QDBusConnection bus_;
    const QString name_;
    const std::chrono::milliseconds patience_;
    ApplicationObject object_;
};

} // namespace quorl
