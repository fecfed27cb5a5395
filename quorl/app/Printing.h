#pragma once

#include "quorl/process/ExitCode.h"
#include "services/media/Inventory.h"

namespace quorl {

/// Says on standard error why there is nothing to choose from, where that is so. With the code the
/// program ends: a folder that is read and has no playlists is a success.
[[nodiscard]] ExitCode tellFolderTrouble(const media::Inventory& inventory);

/// Brings what was printed to standard output. Where that fails it says so on standard error.
[[nodiscard]] ExitCode finishPrinting();

} // namespace quorl
