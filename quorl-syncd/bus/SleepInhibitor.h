#pragma once

#include <sdbus-c++/sdbus-c++.h>

namespace quorl::syncd {

/// Keeps the machine from falling asleep for as long as it lives, where there is a login manager
/// that can be asked to. Where there is none, it does nothing.
class SleepInhibitor {
  public:
    /// Asks the login manager, and waits for it for a second or two.
    SleepInhibitor();

  private:
    /// The machine may sleep as soon as it is closed, also by the end of the process.
    sdbus::UnixFd lock_;
};

} // namespace quorl::syncd
