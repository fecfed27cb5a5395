#pragma once

#include <array>
#include <string>

namespace quorl {

/// What Qt is told of this program, however that shows itself. Made before the application object
/// and outlives it. Main thread.
class QtSetup {
  public:
    /// Names the program to Qt. `program` is how it was called.
    explicit QtSetup(char* program);

    QtSetup(const QtSetup&) = delete;
    QtSetup& operator=(const QtSetup&) = delete;

    /// Whether there is a display to show a window on.
    [[nodiscard]] static bool hasDisplay();

    /// Why there can be no window, and what to do; empty where there is a display.
    [[nodiscard]] static std::string displayProblem();

    /// Has Qt write and lay out as the followed language does. Wants an application object with a
    /// display.
    static void followUsersLanguage();

    /// What the application object is made with: only the program, as Qt's own options are none of
    /// ours.
    [[nodiscard]] int& argumentCount() { return argumentCount_; }

    [[nodiscard]] char** arguments() { return arguments_.data(); }

  private:
    int argumentCount_ = 1;
    std::array<char*, 2> arguments_;
};

} // namespace quorl
