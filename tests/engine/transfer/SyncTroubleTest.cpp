// What can go wrong in the middle of a sync.

#include <fstream>
#include <optional>

#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <sys/mount.h>

#include "tests/engine/Folders.h"

namespace {

using namespace quorl::syncd;
using namespace quorl::syncd::testing;
using ::testing::Contains;
using ::testing::HasSubstr;
using ::testing::Key;
using ::testing::Not;
using Kind = Outcome::Kind;

/// A playlist of three songs, the first of which is there to be copied while the test does
/// something to the others.
class Trouble : public ::testing::Test {
  protected:
    Trouble() {
        music_.write("first.mp3", std::string(3'000'000, '1'));
        music_.write("second.mp3", "second");
        music_.write("third.mp3", "third");
        music_.list({"first.mp3", "second.mp3", "third.mp3"});
    }

    /// Syncs, and calls `act` once while the first song is being copied.
    Outcome syncWhile(const std::function<void()>& act, std::stop_token stop = {}) {
        bool isDone = false;
        return sync(
            wishFor(music_, player_),
            [&](const CopyProgress& progress) {
                if (progress.bytes > 0 && !std::exchange(isDone, true)) {
                    act();
                }
            },
            std::move(stop));
    }

    Music music_;
    Player player_;
};

TEST_F(Trouble, ASongThatVanishesIsLeftOutAndTheOthersAreSent) {
    const auto outcome = syncWhile([&] { music_.remove("second.mp3"); });

    EXPECT_EQ(outcome.kind, Kind::Failed);
    EXPECT_EQ(quorl::engine::sentence(outcome.message),
              "“second.mp3” is no longer in the music folder.");
    EXPECT_TRUE(outcome.isLibraryStale);
    EXPECT_TRUE(outcome.mayPass) << "a song that is there again may be as it was";
    EXPECT_EQ(player_.music().at("List.m3u8"), "#EXTM3U\n#PLAYLIST:List\nfirst.mp3\nthird.mp3\n");
    EXPECT_EQ(player_.music().size(), 3);
    EXPECT_FALSE(player_.manifest().sent);
    EXPECT_EQ(whatIsWrongWith(player_.path()), "");
}

TEST_F(Trouble, ASongThatIsChangedWhileItIsCopiedIsNotTakenForComplete) {
    const auto outcome = syncWhile([&] { music_.write("first.mp3", std::string(3'000'000, '2')); });

    EXPECT_EQ(outcome.kind, Kind::Failed);
    EXPECT_THAT(quorl::engine::sentence(outcome.message),
                HasSubstr("“first.mp3” has just been changed"));
    EXPECT_THAT(player_.music(), Not(Contains(Key("first.mp3"))));
    EXPECT_FALSE(player_.manifest().sent);

    EXPECT_EQ(sync(wishFor(music_, player_)).kind, Kind::Sent) << "the next one brings it";
    EXPECT_EQ(player_.music().at("first.mp3"), std::string(3'000'000, '2'));
}

TEST_F(Trouble, ASongThatGrowsWithoutEndDoesNotFillTheWearable) {
    const auto outcome = sync(wishFor(music_, player_), [&](const CopyProgress& progress) {
        if (progress.bytes > 0) {
            std::ofstream{music_.path() / "first.mp3", std::ios::app}
                << std::string(2'000'000, '2');
        }
    });

    EXPECT_EQ(outcome.kind, Kind::Failed);
    EXPECT_THAT(quorl::engine::sentence(outcome.message), HasSubstr("has just been changed"));
}

TEST_F(Trouble, AnOldCopyStaysWhereTheSongCannotBeReadNow) {
    ASSERT_EQ(sync(wishFor(music_, player_)).kind, Kind::Sent);
    const auto order = wishFor(music_, player_);
    music_.write("second.mp3", "changed");
    const auto newWish = wishFor(music_, player_);
    music_.remove("second.mp3");

    EXPECT_EQ(sync(newWish).kind, Kind::Failed);

    EXPECT_EQ(player_.music().at("second.mp3"), "second");
}

TEST_F(Trouble, StoppingKeepsWhatWasThereAndWhatIsComplete) {
    ASSERT_EQ(sync(wishFor(music_, player_)).kind, Kind::Sent);
    music_.write("fourth.mp3", std::string(3'000'000, '4'));
    music_.write("fifth.mp3", std::string(3'000'000, '5'));
    music_.list({"fourth.mp3", "fifth.mp3"});
    std::stop_source stop;

    const auto outcome = sync(
        wishFor(music_, player_),
        [&](const CopyProgress& progress) {
            if (progress.bytes > 3'000'000) {
                stop.request_stop();
            }
        },
        stop.get_token());

    EXPECT_EQ(outcome.kind, Kind::Stopped);
    EXPECT_EQ(player_.music().size(), 5) << "the three, the playlist and the fourth";
    EXPECT_EQ(player_.music().at("List.m3u8"),
              "#EXTM3U\n#PLAYLIST:List\nfirst.mp3\nsecond.mp3\nthird.mp3\n");
    EXPECT_FALSE(player_.manifest().sent);
    EXPECT_EQ(whatIsWrongWith(player_.path()), "");
    std::optional<std::uint64_t> kept;
    EXPECT_EQ(
        sync(wishFor(music_, player_), [&](const auto& step) { kept = kept.value_or(step.songs); })
            .kind,
        Kind::Sent);
    EXPECT_EQ(kept, 1) << "the fourth was not copied again";
    EXPECT_EQ(player_.music().size(), 3);
}

TEST_F(Trouble, NoFileOfAnUnfinishedSyncStaysBehind) {
    std::stop_source stop;

    EXPECT_EQ(syncWhile([&] { stop.request_stop(); }, stop.get_token()).kind, Kind::Stopped);

    EXPECT_TRUE(player_.music().empty());
}

TEST_F(Trouble, ACopyThatWasLeftBehindByAKilledSyncIsUsedAndARuinedOneIsNot) {
    const auto order = wishFor(music_, player_);
    const auto song = [&](std::size_t at) {
        return order.library->songs[order.playlist().songs[at]];
    };
    player_.write("Music/second.mp3", "second");
    player_.write("Music/third.mp3", "ruins");
    for (const auto* name : {"second.mp3", "third.mp3"}) {
        std::filesystem::last_write_time(player_.path() / "Music" / name,
                                         std::filesystem::last_write_time(music_.path() / name));
    }
    quorl::wearable::Manifest manifest;
    manifest.strays = {{"second.mp3", "second.mp3", 6, song(1).modified, {}},
                       {"third.mp3", "third.mp3", 5, song(2).modified, {}}};
    player_.write(".quorl/manifest.json", toText(manifest));
    std::optional<std::uint64_t> kept;

    EXPECT_EQ(sync(order, [&](const auto& step) { kept = kept.value_or(step.songs); }).kind,
              Kind::Sent);

    EXPECT_EQ(kept, 1);
    EXPECT_EQ(player_.music().at("third.mp3"), "third");
    EXPECT_EQ(player_.music().size(), 4);
}

TEST_F(Trouble, AFileOfSomebodyElseThatTookTheNameOfAnUnfinishedCopyIsKept) {
    const auto order = wishFor(music_, player_);
    quorl::wearable::Manifest manifest;
    manifest.strays = {{"second.mp3", "second.mp3", 6, 1, {}}};
    player_.write(".quorl/manifest.json", toText(manifest));
    player_.write("Music/second.mp3", "not ours");

    EXPECT_EQ(sync(order).kind, Kind::Sent);

    EXPECT_EQ(player_.music().at("second.mp3"), "not ours");
    EXPECT_EQ(player_.music().at("second (2).mp3"), "second");
}

TEST_F(Trouble, AFileOf1970ThatTookTheNameOfAnUnfinishedPlaylistIsKept) {
    quorl::wearable::Manifest manifest;
    manifest.strays = {{"List.m3u8", "List", 8, 0, quorl::wearable::hashOf("our list")}};
    player_.write(".quorl/manifest.json", toText(manifest));
    player_.write("Music/List.m3u8", "not ours");
    std::filesystem::last_write_time(player_.path() / "Music/List.m3u8",
                                     std::chrono::file_clock::from_sys(std::chrono::sys_seconds()));

    EXPECT_EQ(sync(wishFor(music_, player_)).kind, Kind::Sent);

    EXPECT_EQ(player_.music().at("List.m3u8"), "not ours");
}

TEST_F(Trouble, AFileThatAppearsUnderTheNameOfASongMeanwhileIsNotOverwritten) {
    const auto outcome = syncWhile([&] { player_.write("Music/first.mp3", "not ours"); });

    EXPECT_EQ(outcome.kind, Kind::Sent) << quorl::engine::sentence(outcome.message);
    EXPECT_EQ(player_.music().at("first.mp3"), "not ours");
    EXPECT_EQ(player_.music().at("first (2).mp3"), std::string(3'000'000, '1'));
    EXPECT_EQ(player_.music().at("List.m3u8"),
              "#EXTM3U\n#PLAYLIST:List\nfirst (2).mp3\nsecond.mp3\nthird.mp3\n");
}

TEST_F(Trouble, AWearableWithoutEnoughSpaceGetsNothingHalf) {
    Player small{1 << 20};

    const auto outcome = sync(wishFor(music_, small));

    EXPECT_EQ(outcome.kind, Kind::Failed);
    EXPECT_THAT(quorl::engine::sentence(outcome.message),
                HasSubstr("The Velora has not enough space: 3 MB are needed"));
    EXPECT_TRUE(small.music().empty());
    EXPECT_FALSE(small.manifest().sent);
}

TEST_F(Trouble, AWearableThatFillsUpInTheMiddleSaysSoAndKeepsNothingHalf) {
    Player player{std::nullopt};
    if (mount("tmpfs", player.path().c_str(), "tmpfs", 0, "size=4m") != 0) {
        GTEST_SKIP() << "only root may mount";
    }
    music_.write("second.mp3", std::string(700'000, '2'));
    bool isFilled = false;

    const auto outcome = sync(wishFor(music_, player), [&](const CopyProgress& progress) {
        if (progress.bytes > 1'000'000 && !std::exchange(isFilled, true)) {
            player.write("somebody's film", std::string(500'000, 'f'));
        }
    });

    EXPECT_EQ(outcome.kind, Kind::Failed);
    EXPECT_THAT(quorl::engine::sentence(outcome.message), HasSubstr("is full"));
    EXPECT_EQ(whatIsWrongWith(player.path()), "");
    for (const auto& [name, text] : player.music()) {
        EXPECT_FALSE(Device::isUnfinished(name)) << name;
    }
    ASSERT_EQ(umount(player.path().c_str()), 0);
}

TEST_F(Trouble, AWearableWithoutAByteLeftTakesASmallerChoice) {
    Player player{std::nullopt};
    if (mount("tmpfs", player.path().c_str(), "tmpfs", 0, "size=4m") != 0) {
        GTEST_SKIP() << "only root may mount";
    }
    ASSERT_EQ(sync(wishFor(music_, player)).kind, Kind::Sent);
    std::ofstream film(player.path() / "somebody's film");
    while (film << std::string(4096, 'f') << std::flush) {
    }
    ASSERT_EQ(std::filesystem::space(player.path()).available, 0);
    music_.list({"second.mp3", "third.mp3"});

    const auto outcome = sync(wishFor(music_, player));

    EXPECT_EQ(outcome.kind, Kind::Sent) << quorl::engine::sentence(outcome.message);
    EXPECT_EQ(player.music(),
              (Contents{{"second.mp3", "second"},
                        {"third.mp3", "third"},
                        {"List.m3u8", "#EXTM3U\n#PLAYLIST:List\nsecond.mp3\nthird.mp3\n"}}));
    film.close();
    ASSERT_EQ(umount(player.path().c_str()), 0);
}

TEST_F(Trouble, AWriteProtectedWearableSaysSo) {
    Player player{std::nullopt};
    if (mount("tmpfs", player.path().c_str(), "tmpfs", MS_RDONLY, "size=4m") != 0) {
        GTEST_SKIP() << "only root may mount";
    }

    const auto outcome = sync(wishFor(music_, player));

    EXPECT_EQ(outcome.kind, Kind::Failed);
    EXPECT_THAT(quorl::engine::sentence(outcome.message), HasSubstr("write-protected"));
    ASSERT_EQ(umount(player.path().c_str()), 0);
}

TEST_F(Trouble, AWearableWhoseDirectoryVanishesInTheMiddleSaysSo) {
    const auto outcome = syncWhile([&] { std::filesystem::remove_all(player_.path()); });

    EXPECT_EQ(outcome.kind, Kind::Failed);
    EXPECT_THAT(quorl::engine::sentence(outcome.message), HasSubstr("went away"));
    EXPECT_FALSE(std::filesystem::exists(player_.path()));
}

TEST_F(Trouble, AListThatCannotBeReadSaysWhatToDoAndTouchesNothing) {
    player_.write(".quorl/manifest.json", "{\"format\":1,");
    player_.write("Music/first.mp3", "not ours");

    const auto outcome = sync(wishFor(music_, player_));

    EXPECT_EQ(outcome.kind, Kind::Failed);
    EXPECT_THAT(quorl::engine::sentence(outcome.message),
                HasSubstr("Remove the files .quorl/manifest.*"));
    EXPECT_EQ(textOf(player_.path() / ".quorl/manifest.json"), "{\"format\":1,");
    EXPECT_EQ(player_.music().size(), 1);
}

TEST_F(Trouble, AFileInThePlaceOfTheMusicDirectorySaysWhatToDo) {
    player_.write("Music", "not ours");
    const auto outcome = sync(wishFor(music_, player_));
    EXPECT_THAT(quorl::engine::sentence(outcome.message),
                HasSubstr("is not a directory. Give it another name, or remove"));
    EXPECT_EQ(textOf(player_.path() / "Music"), "not ours");
}

TEST_F(Trouble, AMemoryThatIsUsedUpIsToldInWords) {
    const auto outcome =
        sync(wishFor(music_, player_), {}, {},
             [](const auto&) -> std::unique_ptr<Volume> { throw std::bad_alloc(); });
    EXPECT_EQ(quorl::engine::sentence(outcome.message),
              "The Velora could not be synced, for there is not enough memory. "
              "Close some programs.");
    EXPECT_TRUE(outcome.mayPass);
}

TEST_F(Trouble, AMusicDirectoryThatLeadsElsewhereIsNotFollowed) {
    const TemporaryDirectory elsewhere;
    std::filesystem::create_directory_symlink(elsewhere.path(), player_.path() / "Music");

    EXPECT_EQ(sync(wishFor(music_, player_)).kind, Kind::Failed);

    EXPECT_TRUE(std::filesystem::is_empty(elsewhere.path()));
}

TEST_F(Trouble, TwoProgramsDoNotSyncToOneWearableAtATime) {
    Outcome second;

    EXPECT_EQ(syncWhile([&] { second = sync(wishFor(music_, player_)); }).kind, Kind::Sent);

    EXPECT_EQ(second.kind, Kind::Failed);
    EXPECT_THAT(quorl::engine::sentence(second.message), HasSubstr("Another program is syncing"));
}

} // namespace
