#include "services/preferences/ChosenFolder.h"

#include <glib.h>

namespace quorl::preferences {

std::filesystem::path usualMusicFolder() {
    const char* const folder = g_get_user_special_dir(G_USER_DIRECTORY_MUSIC);
    return folder != nullptr ? std::filesystem::path(folder)
                             : std::filesystem::path(g_get_home_dir()) / "Music";
}

std::filesystem::path chosenMusicFolder(const SharedPreferences& preferences) {
    const std::filesystem::path chosen = preferences.get(musicFolder);
    return chosen.is_absolute() ? chosen : usualMusicFolder();
}

std::filesystem::path chosenMusicFolder() {
    const auto opened = SharedPreferences::open({});
    return opened.preferences ? chosenMusicFolder(*opened.preferences) : usualMusicFolder();
}

} // namespace quorl::preferences
