#include "quorl/reports/LibraryReport.h"

#include <iostream>

#include "quorl/app/Printing.h"
#include "runtime/services/SizeText.h"
#include "services/base/Utf8.h"
#include "services/language/Languages.h"
#include "services/language/Numbers.h"
#include "services/language/Translated.h"
#include "services/media/MusicFolder.h"
#include "services/preferences/ChosenPlaces.h"

namespace quorl {

using language::filled;
using language::translated;
using language::translatedCount;

namespace {

std::string songsWords(std::size_t count) {
    return translatedCount("{count} song", "{count} songs", count);
}

std::string kindOf(const media::Playlist& playlist) {
    if (playlist.folder) {
        return translated("folder");
    }
    switch (playlist.generated) {
    case media::Generated::Mix:
        return translated("generated mix");
    case media::Generated::Playlist:
        return translated("generated playlist");
    case media::Generated::No:
        break;
    }
    return {};
}

std::string describe(const media::Playlist& playlist, const media::Inventory& inventory,
                     const std::string& language) {
    const auto kind = kindOf(playlist);
    return filled(kind.empty() ? translated("{name}: {songs}, {size}, {path}")
                               : translated("{name}: {songs}, {size}, {path} ({kind})"),
                  {{"name", base::printable(playlist.name)},
                   {"songs", songsWords(playlist.songs.size())},
                   {"size", sizeText(static_cast<double>(inventory.bytesOf(playlist)), language)},
                   {"path", base::printable(playlist.path)},
                   {"kind", kind}});
}

void printPlaylists(const media::Inventory& inventory) {
    const std::string language = language::followedLanguages().front();
    const auto count = inventory.playlists.size();
    std::cout << filled(translated("{folder}: {playlists}, {songs} listed"),
                        {{"folder", base::printable(inventory.root.string())},
                         {"playlists",
                          translatedCount("{count} playlist", "{count} playlists", count)},
                         {"songs", songsWords(inventory.songs.size())}})
              << '\n';
    for (const auto& playlist : inventory.playlists) {
        std::cout << "  " << describe(playlist, inventory, language) << '\n';
    }
}

void printLeftOut(const media::Inventory& inventory) {
    std::cout << '\n'
              << filled(translated("Left out: {count}"),
                        {{"count", language::numberText(inventory.leftOut.size())}})
              << '\n';
    for (const auto& leftOut : inventory.leftOut) {
        std::cout << "  " << media::describe(leftOut) << '\n';
    }
}

} // namespace

ExitCode printLibrary(const std::filesystem::path& music) {
    const auto inventory = media::scan(music.empty() ? preferences::chosenMusicFolder() : music);
    if (const auto code = tellFolderTrouble(*inventory); code != ExitCode::Success) {
        return code;
    }
    printPlaylists(*inventory);
    if (!inventory->leftOut.empty()) {
        printLeftOut(*inventory);
    }
    return finishPrinting();
}

} // namespace quorl
