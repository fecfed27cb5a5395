// The engine sends the songs of which the pane says that they fit.

#include "tests/limits/LimitCases.h"

#include <algorithm>
#include <map>
#include <memory>
#include <span>

#include <gtest/gtest.h>

#include "quorl-syncd/transfer/Order.h"

namespace {

using namespace quorl;

syncd::Order orderOf(const limits::Case& each) {
    auto library = std::make_shared<media::Inventory>();
    media::Playlist playlist;
    playlist.id = 1;
    const auto folder = library->songs.addDirectory("");
    std::map<int, media::SongIndex> known;
    for (const auto& [number, size] : each.playlist) {
        if (!known.contains(number)) {
            const auto name = std::to_string(number) + ".mp3";
            known[number] = library->songs.add(folder, {"", name, size, 0, media::Kind::Audio});
        }
        playlist.songs.push_back(known.at(number));
    }
    library->playlists.push_back(playlist);
    return {std::move(library), {1, 0, each.kind, each.amount}, {}};
}

TEST(LimitOfTheEngine, IsTheOneOfThePane) {
    for (const auto& each : limits::cases) {
        SCOPED_TRACE(each.situation);
        const auto order = orderOf(each);

        const auto songs = syncd::songsWithinLimit(order);

        std::uint64_t bytes = 0;
        for (const auto song : songs) {
            bytes += order.library->songs[song].size;
        }
        EXPECT_EQ(songs.size(), each.songs);
        EXPECT_EQ(bytes, each.bytes);
        EXPECT_TRUE(
            std::ranges::equal(songs, std::span(order.playlist().songs).first(songs.size())))
            << "from the top on";
    }
}

} // namespace
