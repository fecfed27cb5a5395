#include <atomic>
#include <chrono>
#include <fstream>
#include <future>
#include <memory>
#include <string>
#include <thread>
#include <vector>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "services/media/MusicFolder.h"
#include "tests/base/TemporaryDirectory.h"
#include "tests/media/Inventories.h"
#include "tests/media/WatchedFolder.h"
#include "tests/media/WithoutPrivileges.h"

namespace quorl::media::test {

using tests::TemporaryDirectory;

namespace {

using testing::ElementsAre;

std::size_t lengthOfEventQueue() {
    std::size_t length = 0;
    std::ifstream("/proc/sys/fs/inotify/max_queued_events") >> length;
    return length;
}

} // namespace

TEST(WatchTest, TheFirstInventoryIsToldAndThenThere) {
    const TemporaryDirectory folder;
    folder.writeSongs({"one.mp3"});
    folder.write("List.m3u", "one.mp3\n");
    std::promise<std::shared_ptr<const Inventory>> told;

    const MusicFolder music(folder.path(),
                            [&](auto inventory) { told.set_value(std::move(inventory)); });
    const auto first = told.get_future().get();

    EXPECT_THAT(songsOf(*first, "List.m3u"), ElementsAre("one.mp3"));
    EXPECT_EQ(music.inventory(), first);
    EXPECT_EQ(*first, *scan(folder.path()));
}

TEST(WatchTest, NobodyNeedsToListen) {
    const TemporaryDirectory folder;
    folder.write("List.m3u", "");
    MusicFolder music(folder.path(), nullptr);
    std::promise<void> done;

    music.rescan([&] { done.set_value(); });
    done.get_future().wait();

    EXPECT_EQ(namesOf(*music.inventory()), std::vector<std::string>{"List"});
}

// Songs.

TEST(WatchTest, AMissingSongThatIsAddedIsListed) {
    const TemporaryDirectory folder;
    folder.write("List.m3u", "Album/one.mp3\n");
    WatchedFolder watched(folder.path());

    folder.writeSongs({"Album/one.mp3"}, 12);

    const auto inventory = watched.waitFor(
        [](const Inventory& each) { return each.songs.size() == 1 && each.songs[0].size == 12; });
    EXPECT_TRUE(inventory->hasAudio);
    EXPECT_TRUE(inventory->leftOut.empty());
}

TEST(WatchTest, ASongThatIsRemovedIsLeftOut) {
    const TemporaryDirectory folder;
    folder.writeSongs({"Album/one.mp3"});
    folder.write("List.m3u", "Album/one.mp3\n");
    WatchedFolder watched(folder.path());

    folder.remove("Album/one.mp3");

    const auto inventory = watched.waitForSongs("List.m3u", 0);
    EXPECT_FALSE(inventory->hasAudio);
    EXPECT_THAT(inventory->leftOut,
                ElementsAre(LeftOut{"List.m3u", "Album/one.mp3", Reason::Missing}));
}

TEST(WatchTest, ASongThatGrowsHasItsNewSizeAndThePlaylistANewRevision) {
    const TemporaryDirectory folder;
    folder.writeSongs({"Album/one.mp3"}, 10);
    folder.write("List.m3u", "Album/one.mp3\n");
    WatchedFolder watched(folder.path());
    const auto before = watched.waitForSongs("List.m3u", 1);

    folder.writeSongs({"Album/one.mp3"}, 20);

    const auto after =
        watched.waitFor([](const Inventory& each) { return each.songs[0].size == 20; });
    EXPECT_NE(after->playlists[0].revision, before->playlists[0].revision);
    EXPECT_EQ(after->playlists[0].id, before->playlists[0].id);
}

TEST(WatchTest, ASongThatGetsAnotherTimeHasIt) {
    const TemporaryDirectory folder;
    folder.writeSongs({"one.mp3"});
    folder.write("List.m3u", "one.mp3\n");
    WatchedFolder watched(folder.path());

    folder.setModified("one.mp3", 1'600'000'000'000'000'001);

    watched.waitFor(
        [](const Inventory& each) { return each.songs[0].modified == 1'600'000'000'000'000'001; });
}

TEST(WatchTest, ASongThatIsRenamedIsFoundUnderItsNewName) {
    const TemporaryDirectory folder;
    folder.writeSongs({"one.mp3"});
    folder.write("Old.m3u", "one.mp3\n");
    folder.write("New.m3u", "two.mp3\n");
    WatchedFolder watched(folder.path());

    folder.rename("one.mp3", "two.mp3");

    EXPECT_THAT(songsOf(*watched.waitForSongs("New.m3u", 1), "Old.m3u"), ElementsAre());
}

TEST(WatchTest, WhatALinkLeadsToIsLookedAtWithEveryChange) {
    const TemporaryDirectory folder;
    folder.writeSongs({"Album/one.mp3"}, 10);
    folder.link("links/favourite.mp3", "../Album/one.mp3");
    folder.write("List.m3u", "links/favourite.mp3\n");
    WatchedFolder watched(folder.path());

    folder.writeSongs({"Album/one.mp3"}, 20);

    watched.waitFor([](const Inventory& each) { return each.songs[0].size == 20; });
}

// Playlists.

TEST(WatchTest, APlaylistThatIsAddedRenamedAndRemovedComesMovesAndGoes) {
    const TemporaryDirectory folder;
    folder.writeSongs({"one.mp3"});
    WatchedFolder watched(folder.path());

    folder.write("List.m3u", "one.mp3\n");
    watched.waitForSongs("List.m3u", 1);

    folder.rename("List.m3u", "Renamed.m3u");
    EXPECT_THAT(namesOf(*watched.waitForSongs("Renamed.m3u", 1)), ElementsAre("Renamed"));

    folder.remove("Renamed.m3u");
    watched.waitFor([](const Inventory& each) { return each.playlists.empty(); });
}

TEST(WatchTest, APlaylistThatIsEditedInPlaceListsTheNewSongs) {
    const TemporaryDirectory folder;
    folder.writeSongs({"one.mp3", "two.mp3"});
    folder.write("lists/List.m3u", "../one.mp3\n");
    WatchedFolder watched(folder.path());

    folder.write("lists/List.m3u", "../one.mp3\n../two.mp3\n");

    watched.waitForSongs("lists/List.m3u", 2);
}

TEST(WatchTest, APlaylistThatIsSavedByRenamingListsTheNewSongs) {
    const TemporaryDirectory folder;
    folder.writeSongs({"one.mp3", "two.mp3"});
    folder.write("List.m3u", "one.mp3\n");
    WatchedFolder watched(folder.path());

    folder.replace("List.m3u", "one.mp3\ntwo.mp3\n");

    watched.waitForSongs("List.m3u", 2);
}

TEST(WatchTest, EditsInQuickSuccessionThatLeaveTheSizeAreAllSeen) {
    const TemporaryDirectory folder;
    folder.writeSongs({"one.mp3", "two.mp3"});
    folder.write("List.m3u", "one.mp3\n");
    WatchedFolder watched(folder.path());

    for (const char* const song : {"two.mp3", "one.mp3", "two.mp3", "one.mp3", "two.mp3"}) {
        folder.write("List.m3u", std::string(song) + "\n");
        watched.waitFor([&](const Inventory& each) {
            return each.songs.size() == 1 && each.songs[0].name == song;
        });
    }
}

TEST(WatchTest, APlaylistThatWasNotWrittenLatelyIsReadAgainAfterAnEdit) {
    const TemporaryDirectory folder;
    folder.writeSongs({"one.mp3", "two.mp3"});
    folder.write("List.m3u", "one.mp3\n");
    folder.setModified("List.m3u", 1'600'000'000'000'000'000);
    // So long a file counts as just written, as clocks of file systems go.
    std::this_thread::sleep_until(std::chrono::system_clock::now() + std::chrono::seconds(3));
    WatchedFolder watched(folder.path());
    folder.write("Other.m3u", "one.mp3\n");
    watched.waitForSongs("Other.m3u", 1);
    EXPECT_THAT(songsOf(*watched.waitForSongs("List.m3u", 1), "List.m3u"), ElementsAre("one.mp3"));

    folder.write("List.m3u", "two.mp3\n");
    folder.setModified("List.m3u", 1'600'000'000'000'000'000);

    watched.waitFor([](const Inventory& each) {
        return songsOf(each, "List.m3u") == std::vector<std::string>{"two.mp3"};
    });
}

TEST(WatchTest, APlaylistIsReadOnceItMayBe) {
    const TemporaryDirectory folder;
    folder.writeSongs({"one.mp3"});
    folder.write("List.m3u", "one.mp3\n");
    folder.setPermissions("List.m3u", std::filesystem::perms::none);
    const WithoutPrivileges ordinary;
    WatchedFolder watched(folder.path());
    EXPECT_THAT(watched.waitFor([](const Inventory&) { return true; })->leftOut,
                ElementsAre(LeftOut{"List.m3u", "", Reason::PlaylistUnreadable}));

    withPrivileges([&] { folder.setPermissions("List.m3u", std::filesystem::perms(0644)); });

    watched.waitForSongs("List.m3u", 1);
}

// Directories.

TEST(WatchTest, ADirectoryIsReadOnceItMayBe) {
    const TemporaryDirectory folder;
    folder.writeSongs({"locked/one.mp3"});
    folder.write("locked/List.m3u", "one.mp3\n");
    folder.setPermissions("locked", std::filesystem::perms::none);
    const WithoutPrivileges ordinary;
    WatchedFolder watched(folder.path());

    withPrivileges([&] { folder.setPermissions("locked", std::filesystem::perms(0755)); });

    EXPECT_TRUE(watched.waitForSongs("locked/List.m3u", 1)->leftOut.empty());
}

TEST(WatchTest, ADirectoryThatIsMovedInIsReadAndWatchedAndOneMovedOutIsForgotten) {
    const TemporaryDirectory folder;
    folder.makeDirectory("Music");
    folder.writeSongs({"outside/inner/one.mp3", "outside/inner/two.mp3"});
    folder.write("outside/inner/List.m3u", "one.mp3\n");
    WatchedFolder watched(folder / "Music");

    folder.rename("outside", "Music/inside");
    watched.waitForSongs("inside/inner/List.m3u", 1);

    folder.write("Music/inside/inner/List.m3u", "one.mp3\ntwo.mp3\n");
    watched.waitForSongs("inside/inner/List.m3u", 2);

    folder.rename("Music/inside", "outside");
    watched.waitFor([](const Inventory& each) { return each.playlists.empty(); });

    const std::size_t calls = watched.calls();
    folder.write("outside/inner/List.m3u", "");
    watched.rescan();
    EXPECT_EQ(watched.calls(), calls);
}

TEST(WatchTest, ADirectoryThatIsMovedWithinTheFolderIsStillWatched) {
    const TemporaryDirectory folder;
    folder.writeSongs({"z/album/one.mp3", "z/album/two.mp3"});
    folder.write("z/album/List.m3u", "one.mp3\n");
    folder.makeDirectory("a");
    WatchedFolder watched(folder.path());

    folder.rename("z/album", "a/album");
    watched.waitForSongs("a/album/List.m3u", 1);
    folder.write("a/album/List.m3u", "one.mp3\ntwo.mp3\n");
    watched.waitForSongs("a/album/List.m3u", 2);

    folder.rename("a/album", "z/album");
    watched.waitForSongs("z/album/List.m3u", 2);
    folder.write("z/album/List.m3u", "one.mp3\n");
    watched.waitForSongs("z/album/List.m3u", 1);
}

TEST(WatchTest, ADirectoryThatIsDeletedAndMadeAnewIsWatched) {
    const TemporaryDirectory folder;
    folder.writeSongs({"album/one.mp3", "album/two.mp3"});
    folder.write("album/List.m3u", "one.mp3\n");
    WatchedFolder watched(folder.path());

    watched.holdNextCall();
    folder.write("Other.m3u", "");
    watched.waitUntilHeld();
    folder.remove("album");
    folder.writeSongs({"album/one.mp3", "album/two.mp3"});
    folder.write("album/List.m3u", "one.mp3\none.mp3\n");
    watched.release();
    watched.waitForSongs("album/List.m3u", 2);

    folder.write("album/List.m3u", "one.mp3\n");
    watched.waitForSongs("album/List.m3u", 1);
}

TEST(WatchTest, ADirectoryThatIsReplacedByAnotherOfItsNameIsReadAndWatched) {
    const TemporaryDirectory folder;
    folder.writeSongs({"Music/one.mp3"});
    folder.write("Music/album/List.m3u", "../one.mp3\n");
    folder.write("other/List.m3u", "../one.mp3\n../one.mp3\n");
    WatchedFolder watched(folder / "Music");

    watched.holdNextCall();
    folder.write("Music/Other.m3u", "");
    watched.waitUntilHeld();
    folder.rename("Music/album", "away");
    folder.rename("other", "Music/album");
    watched.release();
    watched.waitForSongs("album/List.m3u", 2);

    folder.write("Music/album/List.m3u", "");
    watched.waitForSongs("album/List.m3u", 0);
}

TEST(WatchTest, DirectoriesThatAreMadeOneInAnotherAreAllFound) {
    const TemporaryDirectory folder;
    WatchedFolder watched(folder.path());

    for (int round = 0; round < 20; ++round) {
        const std::string top = std::to_string(round);
        folder.writeSongs({top + "/a/b/c/d/one.mp3"});
        folder.write(top + "/a/b/c/d/List.m3u", "one.mp3\n");
        watched.waitForSongs(top + "/a/b/c/d/List.m3u", 1);
    }
}

// The music folder itself.

TEST(WatchTest, AFolderThatIsDeletedIsEmptyAndFoundAgainWhenItIsMade) {
    const TemporaryDirectory folder;
    folder.writeSongs({"Music/one.mp3"});
    folder.write("Music/List.m3u", "one.mp3\n");
    WatchedFolder watched(folder / "Music");

    folder.remove("Music");
    const auto gone = watched.waitFor([](const Inventory& each) { return !each.rootFound; });
    EXPECT_TRUE(gone->playlists.empty());
    EXPECT_EQ(gone->songs.size(), 0U);
    EXPECT_FALSE(gone->hasAudio);

    folder.writeSongs({"Music/one.mp3"});
    folder.write("Music/List.m3u", "one.mp3\n");
    watched.waitForSongs("List.m3u", 1);

    folder.write("Music/List.m3u", "");
    watched.waitForSongs("List.m3u", 0);
}

TEST(WatchTest, AFolderIsFoundWhenItAndTheDirectoriesAboveItAreMadeLater) {
    const TemporaryDirectory folder;
    WatchedFolder watched(folder / "home/user/Music");
    EXPECT_FALSE(watched.waitFor([](const Inventory&) { return true; })->rootFound);

    folder.makeDirectory("home");
    folder.writeSongs({"home/user/Music/one.mp3"});
    folder.write("home/user/Music/List.m3u", "one.mp3\n");

    watched.waitForSongs("List.m3u", 1);
}

TEST(WatchTest, AFolderThatIsMovedAwayWithADirectoryAboveItIsEmptyUntilItIsBack) {
    const TemporaryDirectory folder;
    folder.writeSongs({"home/user/Music/one.mp3"});
    folder.write("home/user/Music/List.m3u", "one.mp3\n");
    WatchedFolder watched(folder / "home/user/Music");

    folder.rename("home", "away");
    watched.waitFor([](const Inventory& each) { return !each.rootFound; });

    folder.rename("away", "home");
    watched.waitForSongs("List.m3u", 1);

    folder.rename("home/user", "home/other");
    watched.waitFor([](const Inventory& each) { return !each.rootFound; });
}

TEST(WatchTest, AFolderThatIsReplacedByAnotherIsReadAndWatched) {
    const TemporaryDirectory folder;
    folder.write("Music/Old.m3u", "");
    folder.write("other/New.m3u", "");
    WatchedFolder watched(folder / "Music");

    watched.holdNextCall();
    folder.write("Music/Old 2.m3u", "");
    watched.waitUntilHeld();
    folder.rename("Music", "away");
    folder.rename("other", "Music");
    watched.release();
    watched.waitFor(
        [](const Inventory& each) { return namesOf(each) == std::vector<std::string>{"New"}; });

    folder.write("Music/Newer.m3u", "");
    watched.waitForSongs("Newer.m3u", 0);
}

TEST(WatchTest, AFolderThatIsALinkIsReadWhereTheLinkLeads) {
    const TemporaryDirectory folder;
    folder.write("first/First.m3u", "");
    folder.write("second/Second.m3u", "");
    folder.link("Music", "first");
    folder.link("Music.new", "second");
    WatchedFolder watched(folder / "Music");
    watched.waitForSongs("First.m3u", 0);

    folder.rename("Music.new", "Music");

    watched.waitForSongs("Second.m3u", 0);
}

// What is told, and when.

TEST(WatchTest, NothingIsToldWhenNothingOfInterestChanges) {
    const TemporaryDirectory folder;
    folder.writeSongs({"one.mp3"});
    folder.write("List.m3u", "one.mp3\n");
    folder.setModified("List.m3u", 1'600'000'000'000'000'000);
    WatchedFolder watched(folder.path());
    const auto before = watched.waitForSongs("List.m3u", 1);

    folder.write("List.m3u", "# a comment\none.mp3\n");
    folder.write("notes.txt", "not music");
    folder.writeSongs({"two.mp3"});
    folder.makeDirectory("empty");
    watched.rescan();
    watched.rescan();

    EXPECT_EQ(watched.calls(), 1U);
    EXPECT_EQ(*before, *scan(folder.path()));
}

TEST(WatchTest, ChangesThatCameTogetherAreToldTogether) {
    constexpr int count = 500;
    const TemporaryDirectory folder;
    std::string entries;
    for (int song = 0; song < count; ++song) {
        entries += "Album/" + std::to_string(song) + ".mp3\n";
    }
    folder.makeDirectory("Album");
    folder.write("List.m3u", entries);
    WatchedFolder watched(folder.path());

    watched.holdNextCall();
    folder.write("Other.m3u", "");
    watched.waitUntilHeld();
    const std::size_t calls = watched.calls();
    for (int song = 0; song < count; ++song) {
        folder.writeSongs({"Album/" + std::to_string(song) + ".mp3"});
    }
    watched.release();

    watched.waitForSongs("List.m3u", count);
    EXPECT_EQ(watched.calls(), calls + 1);
}

TEST(WatchTest, ChangesAreSeenAlsoWhenThereWereTooManyToRecord) {
    const TemporaryDirectory folder;
    folder.write("noise/a", "");
    folder.write("noise/b", "");
    folder.write("quiet/List.m3u", "one.mp3\n");
    WatchedFolder watched(folder.path());

    watched.holdNextCall();
    folder.write("Other.m3u", "");
    watched.waitUntilHeld();
    // In turn, for the system merges an event with one like it just before.
    const std::size_t tooMany = lengthOfEventQueue() + 1;
    for (std::size_t event = 0; event < tooMany; event += 2) {
        folder.setModified("noise/a", 0);
        folder.setModified("noise/b", 0);
    }
    folder.writeSongs({"quiet/one.mp3"});
    watched.release();

    watched.waitForSongs("quiet/List.m3u", 1);
}

TEST(WatchTest, ARescanIsToldAsDoneAfterWhatItFound) {
    const TemporaryDirectory folder;
    folder.writeSongs({"one.mp3"});
    WatchedFolder watched(folder.path());

    folder.write("List.m3u", "one.mp3\n");
    watched.rescan();

    EXPECT_EQ(watched.calls(), 2U);
    watched.waitForSongs("List.m3u", 1);
}

// The end.

TEST(WatchTest, AFolderCanBeDestroyedAtAnyMomentOfItsFirstScan) {
    const TemporaryDirectory folder;
    std::string entries;
    for (int directory = 0; directory < 200; ++directory) {
        const std::string song = std::to_string(directory) + "/one.mp3";
        folder.writeSongs({song});
        entries += song + "\ngone.mp3\n";
    }
    folder.write("List.m3u", entries);
    std::atomic<bool> destroyed = false;
    std::atomic<int> lateCalls = 0;

    for (int moment = 0; moment < 50; ++moment) {
        destroyed = false;
        {
            const MusicFolder music(folder.path(),
                                    [&](const auto&) { lateCalls += destroyed ? 1 : 0; });
            for (int turn = 0; turn < moment * 100; ++turn) {
                static_cast<void>(music.inventory());
            }
        }
        destroyed = true;
    }

    EXPECT_EQ(lateCalls, 0);
}

TEST(WatchTest, DestructionWaitsForACallThatIsRunningAndMakesNoFurther) {
    const TemporaryDirectory folder;
    folder.write("List.m3u", "");
    std::promise<void> begun;
    std::promise<void> release;
    const std::shared_future<void> mayEnd = release.get_future();
    std::atomic<int> calls = 0;
    std::atomic<int> ended = 0;
    auto music = std::make_unique<MusicFolder>(folder.path(), [&](const auto&) {
        if (++calls == 1) {
            begun.set_value();
        }
        mayEnd.wait();
        ++ended;
    });
    begun.get_future().wait();
    music->rescan();
    folder.write("Other.m3u", "");

    std::thread releaser([&] { release.set_value(); });
    music.reset();

    EXPECT_GE(ended, 1);
    EXPECT_EQ(ended, calls);
    releaser.join();
}

} // namespace quorl::media::test
