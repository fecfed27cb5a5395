#include "quorl/facts/PlaylistFacts.h"

#include <gtest/gtest.h>

#include "tests/quorl/window/Window.h"

namespace quorl::tests {

namespace {

class Facts : public testing::Test {
  protected:
    /// Of a playlist of songs of these sizes.
    PlaylistFacts of(const std::vector<std::uint64_t>& sizes, const preferences::Limit& limit) {
        media::Inventory inventory;
        inventory.root = "/music";
        const auto directory = inventory.songs.addDirectory("");
        media::Playlist playlist;
        playlist.path = "lists/List.m3u";
        for (const auto size : sizes) {
            playlist.songs.push_back(
                inventory.songs.add(directory, {"", "a.mp3", size, 0, media::Kind::Audio}));
        }
        return factsOf(inventory, playlist, limit);
    }

    Window window_; // whose host words sizes
};

TEST_F(Facts, tellHowMuchOfItTheLimitAllows) {
    using preferences::Limit;
    EXPECT_EQ(of({10, 20}, {}).fit, "All of it is within the limit");
    EXPECT_EQ(of({10, 20, 30}, Limit{.songs = 2}).fit, "The first 2 songs are within the limit");
    EXPECT_EQ(of({10, 20, 1}, Limit{.bytes = 29}).fit, "The first song is within the limit")
        << "the last one would fit, but comes after one that does not";
    EXPECT_EQ(of({10}, Limit{.bytes = 9}).fit, "The first song is beyond the limit");
}

TEST_F(Facts, tellHowLargeItIsAndWhereItsFileIs) {
    const auto facts = of({1'048'576}, {});
    EXPECT_EQ(facts.contents, "1 song, 1 MB");
    EXPECT_EQ(facts.file, "/music/lists/List.m3u");
    EXPECT_EQ(of({}, {}).contents, "No songs");
    EXPECT_EQ(of({}, {}).fit, "");
}

} // namespace

} // namespace quorl::tests
