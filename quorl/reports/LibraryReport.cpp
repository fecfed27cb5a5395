#include "quorl/reports/LibraryReport.h"

#include <iostream>

#include "quorl/app/Printing.h"
#include "runtime/services/SizeText.h"
#include "services/base/Utf8.h"
#include "services/language/Languages.h"
#include "services/media/MusicFolder.h"
#include "services/preferences/ChosenPlaces.h"

namespace quorl {

namespace {

std::string countOf(std::size_t count, const std::string& singular) {
    return std::to_string(count) + " " + singular + (count == 1 ? "" : "s");
}

std::string_view kindOf(const media::Playlist& playlist) {
    if (playlist.folder) {
        return "folder";
    }
    switch (playlist.generated) {
    case media::Generated::Mix:
        return "generated mix";
    case media::Generated::Playlist:
        return "generated playlist";
    case media::Generated::No:
        break;
    }
    return {};
}

std::string describe(const media::Playlist& playlist, const media::Inventory& inventory,
                     const std::string& language) {
    std::string line = base::printable(playlist.name) + ": " +
                       countOf(playlist.songs.size(), "song") + ", " +
                       sizeText(static_cast<double>(inventory.bytesOf(playlist)), language) + ", " +
                       base::printable(playlist.path);
    const auto kind = kindOf(playlist);
    return kind.empty() ? line : line + " (" + std::string(kind) + ")";
}

void printPlaylists(const media::Inventory& inventory) {
    const std::string language = language::followedLanguages().front();
    std::cout << base::printable(inventory.root.string()) << ": "
              << countOf(inventory.playlists.size(), "playlist") << ", "
              << countOf(inventory.songs.size(), "song") << " listed\n";
    for (const auto& playlist : inventory.playlists) {
        std::cout << "  " << describe(playlist, inventory, language) << '\n';
    }
}

void printLeftOut(const media::Inventory& inventory) {
    std::cout << "\nLeft out: " << inventory.leftOut.size() << '\n';
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
