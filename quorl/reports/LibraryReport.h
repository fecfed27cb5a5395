#pragma once

#include "quorl/app/CommandLine.h"

namespace quorl {

/// Prints what the music folder holds and what was left out of its playlists.
[[nodiscard]] ExitCode printLibrary(const Options& options);

} // namespace quorl
