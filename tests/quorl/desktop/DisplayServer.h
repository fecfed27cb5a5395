#pragma once

#include "tests/quorl/QuorlProcess.h"

namespace quorl::tests {

/// A real display that nobody sees, for as long as this object is there. What takes longer than a
/// minute throws.
class DisplayServer {
  public:
    enum class Kind { X11, Wayland };

    /// Waits until it can be used.
    explicit DisplayServer(Kind kind);
    ~DisplayServer();

    DisplayServer(const DisplayServer&) = delete;
    DisplayServer& operator=(const DisplayServer&) = delete;

    /// What makes a program show its windows there.
    [[nodiscard]] const Environment& environment() const { return environment_; }

    /// Ends it under the windows that it shows.
    void end();

  private:
    void startX11();
    void startWayland();

    QProcess process_;
    Environment environment_{{"DISPLAY", ""}, {"WAYLAND_DISPLAY", ""}, {"QT_QPA_PLATFORM", ""}};
};

} // namespace quorl::tests
