#pragma once

#include <string>

#include "services/media/Inventory.h"

namespace quorl {

/// Why there is nothing to choose from in the music folder: what was looked for, where, and what to
/// do. Empty where there is.
[[nodiscard]] std::string troubleIn(const media::Inventory& inventory);

/// Whether the music folder is there but could not be read.
[[nodiscard]] bool isUnreadable(const media::Inventory& inventory);

} // namespace quorl
