#include "quorl/commands/PlaylistList.h"

#include <iostream>

#include <nlohmann/json.hpp>

#include "quorl/app/Printing.h"
#include "quorl/facts/OfferedPlaylists.h"
#include "services/base/Utf8.h"
#include "services/media/MusicFolder.h"
#include "services/preferences/ChosenPlaces.h"

namespace quorl {

namespace {

using Json = nlohmann::ordered_json;

void printLines(const media::Inventory& inventory) {
    for (const auto* playlist : offeredIn(inventory)) {
        // Neither the name's tabs nor its line ends are left.
        std::cout << playlist->id << '\t' << playlist->songs.size() << '\t'
                  << inventory.bytesOf(*playlist) << '\t' << base::printable(playlist->name)
                  << '\n';
    }
}

void printJson(const media::Inventory& inventory) {
    auto list = Json::array();
    for (const auto* playlist : offeredIn(inventory)) {
        // An id has more digits than many a reader of JSON keeps of a number.
        list.push_back({{"id", std::to_string(playlist->id)},
                        {"name", playlist->name},
                        {"songs", playlist->songs.size()},
                        {"bytes", inventory.bytesOf(*playlist)},
                        {"path", playlist->path}});
    }
    std::cout << list.dump(2, ' ', false, Json::error_handler_t::replace) << '\n';
}

} // namespace

ExitCode printPlaylists(const Options& options) {
    const auto& music = options.places.music;
    const auto inventory = media::scan(music.empty() ? preferences::chosenMusicFolder() : music);
    if (const auto code = tellFolderTrouble(*inventory); code != ExitCode::Success) {
        return code;
    }
    options.json ? printJson(*inventory) : printLines(*inventory);
    return finishPrinting();
}

} // namespace quorl
