#pragma once

#include "quorl/app/CommandLine.h"

namespace quorl {

/// Does what was commanded, one after the other. Ends at the first that cannot be done, and says
/// why on standard error; what was done before it stays.
[[nodiscard]] ExitCode runCommands(const Commands& commands);

} // namespace quorl
