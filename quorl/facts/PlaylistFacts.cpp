#include "quorl/facts/PlaylistFacts.h"

#include "platform/SizeFormatter.h"

namespace quorl {

namespace {

std::string countOfSongs(std::size_t count) {
    return std::to_string(count) + (count == 1 ? " song" : " songs");
}

std::string fitOf(std::size_t fitting, std::size_t all) {
    return fitting == all ? "All of it is within the limit"
           : fitting == 0 ? "The first song is beyond the limit"
           : fitting == 1 ? "The first song is within the limit"
                          : "The first " + countOfSongs(fitting) + " are within the limit";
}

} // namespace

PlaylistFacts factsOf(const media::Inventory& inventory, const media::Playlist& playlist,
                      const preferences::Limit& limit) {
    const auto all = playlist.songs.size();
    const auto size = CPFSSizeStrings(static_cast<float>(inventory.bytesOf(playlist)));
    return {all == 0 ? "No songs" : countOfSongs(all) + ", " + size,
            all == 0 ? "" : fitOf(inventory.songsWithin(playlist, limit.bytes, limit.songs), all),
            inventory.root / playlist.path};
}

} // namespace quorl
