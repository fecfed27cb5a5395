#pragma once

#include "quorl/app/CommandLine.h"

namespace quorl {

/// Prints the wearables that can be chosen, as lines or as JSON, on standard output. Takes some
/// seconds where one does not answer.
[[nodiscard]] ExitCode printWearables(const Options& options);

} // namespace quorl
