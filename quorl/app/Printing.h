#pragma once

#include <filesystem>

#include "quorl/app/ExitCode.h"

namespace quorl {

/// Says on standard error that there is no music folder at `root`; the program ends with the code.
[[nodiscard]] ExitCode tellMissingMusicFolder(const std::filesystem::path& root);

/// Brings what was printed to standard output. Where that fails it says so on standard error.
[[nodiscard]] ExitCode finishPrinting();

} // namespace quorl
