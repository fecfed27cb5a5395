#include "services/preferences/ChosenPlaces.h"

#include <glib.h>

namespace quorl::preferences {

namespace {

std::filesystem::path absoluteOrNone(const std::filesystem::path& path) {
    return path.is_absolute() ? path : std::filesystem::path();
}

} // namespace

std::filesystem::path usualMusicFolder() {
    const char* const folder = g_get_user_special_dir(G_USER_DIRECTORY_MUSIC);
    return folder != nullptr ? std::filesystem::path(folder)
                             : std::filesystem::path(g_get_home_dir()) / "Music";
}

std::filesystem::path chosenMusicFolder(const SharedPreferences& preferences) {
    const auto chosen = absoluteOrNone(preferences.get(musicFolder));
    return chosen.empty() ? usualMusicFolder() : chosen;
}

std::filesystem::path chosenMusicFolder() {
    const auto opened = SharedPreferences::open({});
    return opened.preferences ? chosenMusicFolder(*opened.preferences) : usualMusicFolder();
}

std::filesystem::path chosenWearable(const SharedPreferences& preferences) {
    return absoluteOrNone(preferences.get(wearableDirectory));
}

} // namespace quorl::preferences
