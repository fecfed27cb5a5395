#pragma once

#include "quorl/app/CommandLine.h"

namespace quorl {

/// Prints the playlists that can be chosen, as lines or as JSON, on standard output.
[[nodiscard]] ExitCode printPlaylists(const Options& options);

} // namespace quorl
