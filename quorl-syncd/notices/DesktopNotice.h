#pragma once

#include "services/engine/Message.h"

namespace quorl::syncd {

/// Something that a person is told on the desktop.
struct DesktopNotice {
    enum class Kind {
        Done,   ///< A sync that took long has got everything done.
        Failed, ///< A sync was not done, and the person can do something about it.
    };

    Kind kind = Kind::Done;
    /// What became of the sync.
    engine::Message message = {};

    bool operator==(const DesktopNotice&) const = default;
};

} // namespace quorl::syncd
