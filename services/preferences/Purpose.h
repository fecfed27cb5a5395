#pragma once

namespace quorl::preferences {

/// What the preferences are for.
enum class Purpose {
    Use,
    Trial, ///< Values of their own: nothing of the person's own is read or changed.
};

} // namespace quorl::preferences
