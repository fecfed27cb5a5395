#pragma once

#include "quorl/app/CommandLine.h"

namespace quorl {

/// Each shows the panes in its way until the user leaves, or until it is done; `program` is how
/// this program was called.
[[nodiscard]] ExitCode runInWindow(char* program, const Options& options);
[[nodiscard]] ExitCode runInTerminal(char* program, const Options& options);
[[nodiscard]] ExitCode takeScreenshot(char* program, const Options& options);

} // namespace quorl
