// Which songs of the playlist are sent.

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "tests/engine/Folders.h"

namespace {

using namespace quorl::syncd;
using namespace quorl::syncd::testing;
using ::testing::ElementsAre;
using ::testing::IsEmpty;
using ::testing::SizeIs;
namespace LimitType = quorl::preferences::LimitType;

constexpr std::size_t megabyte = 1 << 20;

class Limit : public ::testing::Test {
  protected:
    void listSongsOf(const std::vector<std::size_t>& sizes) {
        std::vector<std::string> names;
        for (const auto size : sizes) {
            names.push_back(std::to_string(names.size()) + ".mp3");
            music_.write(names.back(), std::string(size, 'x'));
        }
        music_.list(names);
    }

    [[nodiscard]] std::vector<std::string> sent(std::uint64_t type, std::uint64_t amount) const {
        const auto order = wishFor(music_, player_, type, amount);
        std::vector<std::string> names;
        for (const auto song : songsWithinLimit(order)) {
            names.push_back(order.library->songs[song].path());
        }
        return names;
    }

    Music music_;
    Player player_;
};

TEST_F(Limit, OfMegabytesIncludesTheSongThatFillsItExactly) {
    listSongsOf({megabyte / 2, megabyte / 2, 1});

    EXPECT_THAT(sent(LimitType::Megabytes, 1), ElementsAre("0.mp3", "1.mp3"));
}

TEST_F(Limit, OfMegabytesEndsAtTheFirstSongThatDoesNotFitThoughALaterOneWould) {
    listSongsOf({100, megabyte, 100});

    EXPECT_THAT(sent(LimitType::Megabytes, 1), ElementsAre("0.mp3"));
}

TEST_F(Limit, OfMegabytesSendsNothingWhenTheFirstSongIsTooLarge) {
    listSongsOf({megabyte + 1, 1});

    EXPECT_THAT(sent(LimitType::Megabytes, 1), IsEmpty());
}

TEST_F(Limit, OfSongsCountsThem) {
    listSongsOf({1, 1, 1, 1, 1});

    EXPECT_THAT(sent(LimitType::Songs, 2), SizeIs(2));
    EXPECT_THAT(sent(LimitType::Songs, 0), IsEmpty());
    EXPECT_THAT(sent(LimitType::Songs, 50), SizeIs(5));
}

TEST_F(Limit, OfAnUnknownKindIsNone) {
    listSongsOf({megabyte, megabyte, megabyte});

    EXPECT_THAT(sent(2, 1), SizeIs(3));
    EXPECT_THAT(sent(~std::uint64_t{0}, 0), SizeIs(3));
}

TEST_F(Limit, CountsASongTwiceThatIsListedTwice) {
    music_.write("a.mp3", std::string(megabyte / 2, 'x'));
    music_.write("b.mp3", "b");
    music_.list({"a.mp3", "a.mp3", "b.mp3"});

    EXPECT_THAT(sent(LimitType::Songs, 2), ElementsAre("a.mp3", "a.mp3"));
    EXPECT_THAT(sent(LimitType::Megabytes, 1), ElementsAre("a.mp3", "a.mp3"));
}

} // namespace
