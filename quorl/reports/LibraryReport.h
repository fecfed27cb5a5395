#pragma once

#include <filesystem>

#include "quorl/process/ExitCode.h"

namespace quorl {

/// Prints what the folder `music` holds and what was left out of its playlists. An empty path
/// stands for the folder that was chosen.
[[nodiscard]] ExitCode printLibrary(const std::filesystem::path& music);

} // namespace quorl
