#pragma once

#include "quorl-syncd/notices/DesktopNotice.h"

namespace quorl::syncd {

/// The one place on the desktop for a notice. Whether one is seen there is up to the desktop.
class NoticeBoard {
  public:
    virtual ~NoticeBoard() = default;

    /// In place of the one before. Returns at once.
    virtual void show(const DesktopNotice& notice) = 0;

    /// Takes it away again, if it is still there. Returns at once.
    virtual void withdraw() = 0;
};

} // namespace quorl::syncd
