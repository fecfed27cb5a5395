#pragma once

#include <sys/types.h>

#include "services/base/FileDescriptor.h"

namespace quorl {

/// Keeps off a screen what this process, and those that it starts, say on standard error, and says
/// it when the screen is left. Main thread.
class HeldErrors {
  public:
    HeldErrors() = default;
    HeldErrors(const HeldErrors&) = delete;
    HeldErrors& operator=(const HeldErrors&) = delete;

    /// Says what has come.
    ~HeldErrors();

    /// From now on. Nothing where standard error is no terminal, for then it spoils none.
    void hold();

    /// Says what has come, and lets standard error be as it was.
    void release();

  private:
    void say();

    base::FileDescriptor standardError_; ///< as it was; none while nothing is held
    base::FileDescriptor kept_;
    off_t said_ = 0; ///< of what was kept, in bytes
};

} // namespace quorl
