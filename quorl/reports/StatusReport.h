#pragma once

#include "quorl/app/CommandLine.h"

namespace quorl {

/// Prints how the sync and the wearable stand, as text or as one JSON object, on standard output.
/// Without an engine it says so, which is no failure; without a session bus it is one.
[[nodiscard]] ExitCode printStatus(const Options& options);

} // namespace quorl
