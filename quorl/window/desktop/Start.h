#pragma once

#include <QByteArray>

#include "quorl/app/Places.h"

namespace quorl {

/// What a person's start of the app brings along.
struct Start {
    Places places;
    QByteArray token; ///< by which the desktop lets the window come to the front; empty for none

    /// A start with these places, and with the token that the desktop left in the environment. To
    /// be called before the application object is made, which takes it out.
    [[nodiscard]] static Start with(const Places& places);
};

} // namespace quorl
