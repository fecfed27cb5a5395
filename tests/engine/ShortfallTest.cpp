// What the engine tells of songs that are not on their way.

#include "quorl-syncd/engine/Shortfall.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "services/preferences/Preference.h"

namespace {

using namespace quorl;
using namespace quorl::syncd;
using engine::LeftOutItem;
using media::Reason;
using ::testing::ElementsAre;
using ::testing::SizeIs;
namespace LimitType = preferences::LimitType;

class ShortfallTest : public ::testing::Test {
  protected:
    ShortfallTest() {
        library_->playlists = {{1, 5, "List", "a/List.m3u8", false, {}, {0, 1, 1}},
                               {2, 5, "a", "a", true, {}, {0, 1, 1}}};
        const auto directory = library_->songs.addDirectory("");
        library_->songs.add(directory, {{}, "one.mp3", 10, 1, media::Kind::Audio});
        library_->songs.add(directory, {{}, "two.mp3", 20, 1, media::Kind::Audio});
    }

    [[nodiscard]] Order order(std::uint64_t playlist, std::uint64_t songs) const {
        return {library_, {playlist, 5, LimitType::Songs, songs}, {}};
    }

    std::shared_ptr<media::Inventory> library_ = std::make_shared<media::Inventory>();
};

TEST_F(ShortfallTest, IsNothingWhereEverythingIsSent) {
    EXPECT_EQ(shortfallOf(order(1, 3), {}), Shortfall());
}

TEST_F(ShortfallTest, CountsWhatTheLimitLeavesOut) {
    EXPECT_EQ(shortfallOf(order(1, 1), {}).beyondLimit, 2);
}

TEST_F(ShortfallTest, HasWhatTheMusicFolderLeavesOutOfThisPlaylistAndWhatTheLastSyncDid) {
    library_->leftOut = {{"a/List.m3u8", "gone.mp3", Reason::Missing},
                         {"a/Other.m3u8", "other.mp3", Reason::Hidden}};
    const auto shortfall =
        shortfallOf(order(1, 3), {engine::Message{"song-unreadable", {"one.mp3", "No."}}});

    EXPECT_THAT(shortfall.leftOut, ElementsAre(LeftOutItem("one.mp3", "song-unreadable"),
                                               LeftOutItem("gone.mp3", "missing")));
    EXPECT_EQ(shortfall.leftOutCount, 2);
}

TEST_F(ShortfallTest, OfAFolderIsThatOfThePlaylistsInIt) {
    library_->leftOut = {{"List.m3u8", "above.mp3", Reason::Missing},
                         {"a", "", Reason::DirectoryUnreadable},
                         {"a/Bad.m3u8", "", Reason::PlaylistBroken},
                         {"a/List.m3u8", "gone.mp3", Reason::Missing},
                         {"a/Same.m3u8", "", Reason::SameAsAnother},
                         {"a/b", "", Reason::DirectoryUnreadable},
                         {"a/b/List.m3u8", "below.mp3", Reason::Missing}};

    EXPECT_THAT(
        shortfallOf(order(2, 3), {}).leftOut,
        ElementsAre(LeftOutItem("", "playlist-broken"), LeftOutItem("gone.mp3", "missing")));
}

TEST_F(ShortfallTest, ListsSomeOfVeryMuch) {
    library_->leftOut.assign(501, {"a/List.m3u8", "gone.mp3", Reason::Missing});

    const auto shortfall = shortfallOf(order(1, 3), {});

    EXPECT_THAT(shortfall.leftOut, SizeIs(500));
    EXPECT_EQ(shortfall.leftOutCount, 501);
}

} // namespace
