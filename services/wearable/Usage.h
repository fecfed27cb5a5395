#pragma once

#include <cstdint>
#include <optional>
#include <string>

#include "services/wearable/Manifest.h"
#include "services/wearable/Unseen.h"
#include "services/wearable/Wearable.h"

namespace quorl::wearable {

/// How a wearable stood at one moment. Byte counts all.
struct Usage {
    /// What it holds at most.
    std::uint64_t capacity = 0;
    /// What an ordinary user may still write to it.
    std::uint64_t available = 0;
    /// What the songs take that we have put there and that are still there.
    std::uint64_t songs = 0;
    /// How many songs these are.
    std::uint64_t songCount = 0;
    /// What was last sent to it in full; nothing where that is not known, where a file of it is
    /// gone or has another size, or where the playlist is not as it was.
    std::optional<Selection> sent = {};

    bool operator==(const Usage&) const = default;
};

/// Looks at the wearable. Takes as long as the device takes; see UsageReader for callers that
/// cannot wait. The one that is embedded is made where it does not exist.
///
/// Throws `CannotBeSeen` when the wearable is not there or cannot be read.
[[nodiscard]] Usage readUsage(const Wearable& wearable);

/// What may still be written to the wearable whose top directory is open as `root`, in bytes.
/// Throws `std::system_error`.
[[nodiscard]] std::uint64_t availableBytes(const Wearable& wearable, int root);

} // namespace quorl::wearable
