#pragma once

#include "quorl/app/Places.h"
#include "quorl/process/ExitCode.h"

namespace quorl {

/// Shows the panes in the terminal until the user leaves or the input ends. `program` is how this
/// program was called.
[[nodiscard]] ExitCode runInTerminal(char* program, const Places& places);

} // namespace quorl
