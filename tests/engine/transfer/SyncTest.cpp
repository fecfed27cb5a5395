// What is on the wearable after a sync.

#include <optional>

#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <sys/stat.h>

#include "tests/engine/Folders.h"

namespace {

using namespace quorl::syncd;
using namespace quorl::syncd::testing;
using ::testing::IsEmpty;
using Kind = Outcome::Kind;

class SyncedWearable : public ::testing::Test {
  protected:
    SyncedWearable() {
        music_.write("Album/one.mp3", "one");
        music_.write("Album/two.ogg", "two two");
        music_.list({"Album/two.ogg", "Album/one.mp3"});
    }

    Outcome syncAll() {
        std::optional<std::uint64_t> before;
        return sync(wishFor(music_, player_), [&](const CopyProgress& progress) {
            before = before.value_or(progress.songs);
            copiedSongs_ = progress.songs - *before;
        });
    }

    Music music_;
    Player player_;
    std::uint64_t copiedSongs_ = 0;
};

TEST_F(SyncedWearable, HasTheSongsByteForByteAndAPlaylistThatPlaysThem) {
    const auto outcome = syncAll();

    EXPECT_EQ(outcome.kind, Kind::Sent) << quorl::engine::sentence(outcome.message);
    EXPECT_EQ(quorl::engine::sentence(outcome.message), "2 songs synced to Velora.");
    EXPECT_EQ(player_.music(),
              (Contents{{"one.mp3", "one"},
                        {"two.ogg", "two two"},
                        {"List.m3u8", "#EXTM3U\n#PLAYLIST:List\ntwo.ogg\none.mp3\n"}}));
    EXPECT_EQ(player_.manifest().sent, wishFor(music_, player_).selection);
    EXPECT_EQ(whatIsWrongWith(player_.path()), "");
}

TEST_F(SyncedWearable, IsNotTouchedWhenNothingHasChanged) {
    ASSERT_EQ(syncAll().kind, Kind::Sent);

    struct stat before {};

    ASSERT_EQ(stat((player_.path() / ".quorl").c_str(), &before), 0);
    const auto contents = contentsOf(player_.path());

    EXPECT_EQ(syncAll().kind, Kind::Sent);

    struct stat after {};

    ASSERT_EQ(stat((player_.path() / ".quorl").c_str(), &after), 0);
    EXPECT_EQ(copiedSongs_, 0);
    EXPECT_EQ(contentsOf(player_.path()), contents);
    EXPECT_EQ(before.st_mtim.tv_nsec, after.st_mtim.tv_nsec) << "nothing was written";
}

TEST_F(SyncedWearable, GetsOnlyTheNewSong) {
    ASSERT_EQ(syncAll().kind, Kind::Sent);
    music_.write("three.mp3", "three");
    music_.list({"three.mp3", "Album/one.mp3", "Album/two.ogg"});

    EXPECT_EQ(syncAll().kind, Kind::Sent);

    EXPECT_EQ(copiedSongs_, 1);
    EXPECT_EQ(player_.music().at("List.m3u8"),
              "#EXTM3U\n#PLAYLIST:List\nthree.mp3\none.mp3\ntwo.ogg\n");
    EXPECT_EQ(player_.music().at("three.mp3"), "three");
}

TEST_F(SyncedWearable, LosesASongThatIsNoLongerInThePlaylist) {
    ASSERT_EQ(syncAll().kind, Kind::Sent);
    music_.list({"Album/one.mp3"});

    EXPECT_EQ(syncAll().kind, Kind::Sent);

    EXPECT_EQ(copiedSongs_, 0);
    EXPECT_EQ(player_.music(),
              (Contents{{"one.mp3", "one"}, {"List.m3u8", "#EXTM3U\n#PLAYLIST:List\none.mp3\n"}}));
    EXPECT_THAT(player_.manifest().strays, IsEmpty());
}

TEST_F(SyncedWearable, GetsTheNewContentsOfASong) {
    ASSERT_EQ(syncAll().kind, Kind::Sent);
    music_.write("Album/one.mp3", "neu");

    EXPECT_EQ(syncAll().kind, Kind::Sent);

    EXPECT_EQ(copiedSongs_, 1);
    EXPECT_EQ(player_.music().size(), 3);
    EXPECT_EQ(player_.music().at(std::string(player_.manifest().songs.back().name())), "neu");
    EXPECT_EQ(whatIsWrongWith(player_.path()), "");
}

TEST_F(SyncedWearable, DoesNotGetASongAgainOfWhichOnlyTheTimeHasChanged) {
    ASSERT_EQ(syncAll().kind, Kind::Sent);
    music_.write("Album/one.mp3", "one");

    EXPECT_EQ(syncAll().kind, Kind::Sent);
    EXPECT_EQ(copiedSongs_, 0);
}

TEST_F(SyncedWearable, GetsASongOf2046Once) {
    constexpr std::time_t year2046 = 2'398'377'600; // what 32 bits count to ends in 2038
    ASSERT_EQ(music_.setTime("Album/one.mp3", year2046), year2046);

    EXPECT_EQ(syncAll().kind, Kind::Sent);
    EXPECT_EQ(copiedSongs_, 2);
    EXPECT_THAT(player_.manifest().songs,
                ::testing::Contains(::testing::Field(&quorl::wearable::Entry::modified,
                                                     std::int64_t{year2046} * 1'000'000'000)));

    EXPECT_EQ(syncAll().kind, Kind::Sent);
    EXPECT_EQ(copiedSongs_, 0);
}

TEST_F(SyncedWearable, GetsASongFromTheFarFutureOnce) {
    constexpr std::time_t year2500 = 16'725'225'600;
    constexpr std::time_t beyondWhatIsTold = 8'500'000'000;
    if (music_.setTime("Album/one.mp3", year2500) <= beyondWhatIsTold) {
        GTEST_SKIP() << "this file system has no such times";
    }

    const auto outcome = syncAll();

    EXPECT_EQ(outcome.kind, Kind::Sent) << quorl::engine::sentence(outcome.message);
    EXPECT_EQ(copiedSongs_, 2);
    EXPECT_EQ(syncAll().kind, Kind::Sent);
    EXPECT_EQ(copiedSongs_, 0);
}

TEST_F(SyncedWearable, GetsASongAgainThatSomebodyHasRemovedFromIt) {
    ASSERT_EQ(syncAll().kind, Kind::Sent);
    std::filesystem::remove(player_.path() / "Music/one.mp3");

    EXPECT_EQ(syncAll().kind, Kind::Sent);

    EXPECT_EQ(copiedSongs_, 1);
    EXPECT_EQ(player_.music().at("one.mp3"), "one");
}

TEST_F(SyncedWearable, HasASongOnceThatIsListedTwiceButPlaysItTwice) {
    music_.list({"Album/one.mp3", "Album/two.ogg", "Album/one.mp3"});

    EXPECT_EQ(syncAll().kind, Kind::Sent);

    EXPECT_EQ(copiedSongs_, 2);
    EXPECT_EQ(player_.music().size(), 3);
    EXPECT_EQ(player_.music().at("List.m3u8"),
              "#EXTM3U\n#PLAYLIST:List\none.mp3\ntwo.ogg\none.mp3\n");
}

TEST_F(SyncedWearable, KeepsFilesOfOthersAlsoWhereTheyHaveTheNamesThatOursWouldHave) {
    player_.write("Music/ONE.mp3", "not ours");
    player_.write("Music/list.M3U8", "not ours either");
    player_.write("Photos/one.mp3", "elsewhere");

    EXPECT_EQ(syncAll().kind, Kind::Sent);
    music_.list({"Album/two.ogg"});
    EXPECT_EQ(syncAll().kind, Kind::Sent);

    EXPECT_EQ(player_.music().at("ONE.mp3"), "not ours");
    EXPECT_EQ(player_.music().at("list.M3U8"), "not ours either");
    EXPECT_EQ(player_.music().at("List (2).m3u8"), "#EXTM3U\n#PLAYLIST:List\ntwo.ogg\n");
    EXPECT_EQ(textOf(player_.path() / "Photos/one.mp3"), "elsewhere");
    EXPECT_EQ(player_.music().size(), 4);
}

TEST_F(SyncedWearable, KeepsSongsOfOneNameFromSeveralFoldersApart) {
    music_.write("A/Intro.mp3", "a");
    music_.write("B/intro.mp3", "b");
    music_.write("C/What?.mp3", "c");
    music_.list({"A/Intro.mp3", "B/intro.mp3", "C/What?.mp3"});

    EXPECT_EQ(syncAll().kind, Kind::Sent);

    EXPECT_EQ(player_.music(),
              (Contents{{"Intro.mp3", "a"},
                        {"intro (2).mp3", "b"},
                        {"What_.mp3", "c"},
                        {"List.m3u8",
                         "#EXTM3U\n#PLAYLIST:List\nIntro.mp3\nintro (2).mp3\nWhat_.mp3\n"}}));
}

TEST_F(SyncedWearable, PlaysASongWhoseNameWouldBeACommentInAPlaylist) {
    music_.write("#1 hit.mp3", "hit");
    music_.list({"./#1 hit.mp3"});

    EXPECT_EQ(syncAll().kind, Kind::Sent);

    EXPECT_EQ(player_.music().at("List.m3u8"), "#EXTM3U\n#PLAYLIST:List\n./#1 hit.mp3\n");
    EXPECT_EQ(player_.music().at("#1 hit.mp3"), "hit");
}

TEST_F(SyncedWearable, GetsTheSongsThatLinksInTheFolderLeadTo) {
    music_.link("relative.mp3", "Album/one.mp3");
    music_.link("absolute.ogg", music_.path() / "Album/two.ogg");
    music_.list({"relative.mp3", "absolute.ogg"});

    const auto outcome = syncAll();

    EXPECT_EQ(outcome.kind, Kind::Sent) << quorl::engine::sentence(outcome.message);
    EXPECT_EQ(player_.music().at("relative.mp3"), "one");
    EXPECT_EQ(player_.music().at("absolute.ogg"), "two two");
}

TEST_F(SyncedWearable, DoesNotGetWhatALinkThatCameMeanwhileLeadsToElsewhere) {
    const TemporaryDirectory elsewhere;
    elsewhere.write("secret.mp3", "one");
    const auto order = wishFor(music_, player_);
    music_.remove("Album/one.mp3");
    music_.link("Album/one.mp3", elsewhere.path() / "secret.mp3");

    EXPECT_EQ(sync(order).kind, Kind::Failed);

    EXPECT_EQ(player_.music().count("one.mp3"), 0);
}

TEST_F(SyncedWearable, ReplacesThePlaylistByAnotherOne) {
    ASSERT_EQ(syncAll().kind, Kind::Sent);
    music_.list({"Album/one.mp3"}, "Other");

    EXPECT_EQ(sync(wishFor(music_, player_, noLimit, 0, "Other")).kind, Kind::Sent);

    EXPECT_EQ(player_.music(), (Contents{{"one.mp3", "one"},
                                         {"Other.m3u8", "#EXTM3U\n#PLAYLIST:Other\none.mp3\n"}}));
}

TEST_F(SyncedWearable, IsSyncedWithAnEmptyPlaylist) {
    ASSERT_EQ(syncAll().kind, Kind::Sent);
    music_.list({});

    const auto outcome = syncAll();

    EXPECT_EQ(outcome.kind, Kind::Sent);
    EXPECT_EQ(quorl::engine::sentence(outcome.message), "0 songs synced to Velora.");
    EXPECT_EQ(player_.music(), (Contents{{"List.m3u8", "#EXTM3U\n#PLAYLIST:List\n"}}));
}

TEST_F(SyncedWearable, CountsOnlyWhatIsNewAgainstItsSpace) {
    music_.write("large.mp3", std::string(600'000, 'x'));
    music_.list({"large.mp3"});
    Player small{1 << 20};
    ASSERT_EQ(sync(wishFor(music_, small)).kind, Kind::Sent);
    music_.write("another.mp3", std::string(300'000, 'y'));
    music_.list({"large.mp3", "another.mp3"});

    const auto outcome = sync(wishFor(music_, small));

    EXPECT_EQ(outcome.kind, Kind::Sent) << quorl::engine::sentence(outcome.message);
}

TEST_F(SyncedWearable, IsToldOfItsProgressPieceByPieceAndNeverBackwardsOrTooMuch) {
    constexpr std::uint64_t size = 5'000'000;
    music_.write("large.mp3", std::string(size, 'x'));
    music_.list({"Album/one.mp3", "large.mp3"});
    std::vector<CopyProgress> steps;

    ASSERT_EQ(sync(wishFor(music_, player_), [&](const auto& step) { steps.push_back(step); }).kind,
              Kind::Sent);

    EXPECT_EQ(steps.front().bytes, 0);
    EXPECT_GE(steps.size(), 6) << "a large file moves it";
    for (std::size_t at = 1; at < steps.size(); ++at) {
        EXPECT_GE(steps[at].bytes, steps[at - 1].bytes);
        EXPECT_GE(steps[at].songs, steps[at - 1].songs);
        EXPECT_EQ(steps[at].totalBytes, size + 3);
        EXPECT_EQ(steps[at].totalSongs, 2);
    }
    EXPECT_EQ(steps.back().bytes, size + 3);
    EXPECT_EQ(steps.back().songs, 2);
    EXPECT_EQ(steps.back().song, "");
    EXPECT_EQ(steps[steps.size() - 2].song, "large.mp3");
}

TEST_F(SyncedWearable, GoesOnWithItsProgressWhereAnInterruptedSyncHasEnded) {
    music_.write("large.mp3", std::string(3'000'000, 'x'));
    music_.list({"Album/one.mp3", "Album/two.ogg", "large.mp3"});
    std::stop_source stop;
    const auto interrupted = sync(
        wishFor(music_, player_),
        [&](const CopyProgress& progress) {
            if (progress.song == "large.mp3") {
                stop.request_stop();
            }
        },
        stop.get_token());
    ASSERT_EQ(interrupted.kind, Kind::Stopped);
    std::vector<CopyProgress> steps;

    ASSERT_EQ(sync(wishFor(music_, player_), [&](const auto& step) { steps.push_back(step); }).kind,
              Kind::Sent);

    EXPECT_EQ(steps.front(), (CopyProgress{2, 3, 10, 3'000'010}));
    EXPECT_EQ(steps.back(), (CopyProgress{3, 3, 3'000'010, 3'000'010}));
}

TEST_F(SyncedWearable, IsDoneFromTheBeginningWhereThereIsNothingToCopy) {
    ASSERT_EQ(syncAll().kind, Kind::Sent);
    std::vector<CopyProgress> steps;

    ASSERT_EQ(sync(wishFor(music_, player_), [&](const auto& step) { steps.push_back(step); }).kind,
              Kind::Sent);

    EXPECT_EQ(steps.front(), (CopyProgress{2, 2, 10, 10}));
}

TEST_F(SyncedWearable, HasOnlyWhatOthersPutThereOnceItsMusicWasRemoved) {
    player_.write("Music/foreign.mp3", "of others");
    ASSERT_EQ(syncAll().kind, Kind::Sent);
    const Order removal{std::make_shared<quorl::media::Inventory>(), {}, player_.wearable()};

    const auto outcome = sync(removal);

    EXPECT_EQ(outcome.kind, Kind::Sent);
    EXPECT_EQ(quorl::engine::sentence(outcome.message), "The music was removed from the Velora.");
    EXPECT_EQ(player_.music(), (Contents{{"foreign.mp3", "of others"}}));
    EXPECT_EQ(player_.manifest(), quorl::wearable::Manifest());
    EXPECT_EQ(sync(removal).kind, Kind::Sent) << "of nothing";
    EXPECT_EQ(syncAll().kind, Kind::Sent);
    EXPECT_EQ(player_.music().size(), 4);
}

TEST_F(SyncedWearable, StopsBeingEmptiedWhereItIsAskedTo) {
    ASSERT_EQ(syncAll().kind, Kind::Sent);
    const Order removal{std::make_shared<quorl::media::Inventory>(), {}, player_.wearable()};
    std::stop_source stop;
    const auto stopAtOnce = [&](const CopyProgress& /*progress*/) { stop.request_stop(); };

    EXPECT_EQ(sync(removal, stopAtOnce, stop.get_token()).kind, Kind::Stopped);

    EXPECT_FALSE(player_.manifest().sent);
    EXPECT_EQ(whatIsWrongWith(player_.path()), "");
    EXPECT_EQ(sync(removal).kind, Kind::Sent);
    EXPECT_TRUE(player_.music().empty());
}

TEST_F(SyncedWearable, SaysWhatOfThePlaylistCouldNotBeFound) {
    music_.list({"Album/one.mp3", "gone.mp3", "gone too.mp3"});

    const auto outcome = syncAll();

    EXPECT_EQ(outcome.kind, Kind::Sent);
    EXPECT_EQ(outcome.message, (quorl::engine::Message{"synced-but", {"1", "2"}}));
}

} // namespace
