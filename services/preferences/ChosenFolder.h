#pragma once

#include <filesystem>

#include "services/preferences/SharedPreferences.h"

namespace quorl::preferences {

/// The user's own music folder, as the desktop has it. Not one that was chosen here.
[[nodiscard]] std::filesystem::path usualMusicFolder();

/// The music folder that was chosen, or else the usual one. Absolute.
[[nodiscard]] std::filesystem::path chosenMusicFolder(const SharedPreferences& preferences);

/// The same, for who does not have the preferences open; takes as long as to open them.
[[nodiscard]] std::filesystem::path chosenMusicFolder();

} // namespace quorl::preferences
