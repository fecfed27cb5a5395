#pragma once

#include "quorl/app/Places.h"
#include "quorl/process/ExitCode.h"

namespace quorl {

/// Shows the panes in a window until the user closes it. `program` is how this program was called.
[[nodiscard]] ExitCode runInWindow(char* program, const Places& places);

} // namespace quorl
