#pragma once

#include "quorl/app/CommandLine.h"

namespace quorl {

/// Prints how the sync and the wearable stand, as text or as one JSON object, on standard output.
/// All that it prints is what the engine tells; without an engine it says so, which is no failure,
/// and that little else is known. Without a session bus it is one.
[[nodiscard]] ExitCode printStatus(const Options& options);

} // namespace quorl
