#pragma once

#include <filesystem>

#include "services/preferences/SharedPreferences.h"

namespace quorl::preferences {

/// The user's own music folder, as the desktop has it. Not one that was chosen here.
[[nodiscard]] std::filesystem::path usualMusicFolder();

/// The music folder that was chosen, or else the usual one. Absolute: what is not counts as none,
/// for no two programs would mean the same by it.
[[nodiscard]] std::filesystem::path chosenMusicFolder(const SharedPreferences& preferences);

/// The same, for who does not have the preferences open; takes as long as to open them.
[[nodiscard]] std::filesystem::path chosenMusicFolder();

/// Where the wearable that was chosen is mounted; empty for the one in this machine. Absolute.
[[nodiscard]] std::filesystem::path chosenWearable(const SharedPreferences& preferences);

} // namespace quorl::preferences
