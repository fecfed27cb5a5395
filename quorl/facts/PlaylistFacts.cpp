#include "quorl/facts/PlaylistFacts.h"

#include "quorl/facts/SizeWords.h"
#include "services/language/Translated.h"

namespace quorl {

using language::translated;

namespace {

std::string fitOf(std::size_t fitting, std::size_t all) {
    return fitting == all ? translated("All of it is within the limit")
           : fitting == 0
               ? translated("The first song is beyond the limit")
               : language::translatedCount("The first song is within the limit",
                                           "The first {count} songs are within the limit", fitting);
}

} // namespace

PlaylistFacts factsOf(const media::Inventory& inventory, const media::Playlist& playlist,
                      const preferences::Limit& limit) {
    const auto all = playlist.songs.size();
    return {all == 0 ? translated("No songs") : songsWords(all, inventory.bytesOf(playlist)),
            all == 0 ? "" : fitOf(inventory.songsWithin(playlist, limit.bytes, limit.songs), all),
            inventory.root / playlist.path};
}

} // namespace quorl
