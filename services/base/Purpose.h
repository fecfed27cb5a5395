#pragma once

namespace quorl::base {

/// What the programs are used for.
enum class Purpose {
    Use,
    /// A trial has settings, an engine and an embedded wearable of its own: nothing of the person's
    /// own is changed.
    Trial,
};

} // namespace quorl::base
