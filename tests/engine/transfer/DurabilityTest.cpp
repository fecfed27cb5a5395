// That a sync loses nothing, whatever fails, and takes its steps in an order that a loss of power
// cannot spoil.

#include <algorithm>
#include <cerrno>
#include <optional>
#include <system_error>

#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <sys/stat.h>

#include "services/wearable/Generations.h"
#include "tests/engine/Folders.h"
#include "tests/engine/transfer/ObservedVolume.h"

namespace {

using namespace quorl;
using namespace quorl::syncd;
using namespace quorl::syncd::testing;
using ::testing::Contains;
using ::testing::HasSubstr;
using ::testing::Key;
using ::testing::Not;
using Kind = Outcome::Kind;

Outcome observedSync(const Order& order, const ObservedVolume::Before& before,
                     const Sync::Told& told = {}) {
    return sync(order, told, {}, [&](const auto& wearable) {
        return std::make_unique<ObservedVolume>(openPosixVolume(wearable), before);
    });
}

[[noreturn]] void fail(int error) { throw std::system_error(error, std::generic_category()); }

/// Two songs were sent; others are there, and now one of the two is wished for and two more.
class Durability : public ::testing::Test {
  protected:
    Durability() { prepare(player_); }

    void prepare(Player& player) {
        music_.write("one.mp3", "one");
        music_.write("two.mp3", "two two");
        music_.write("three.mp3", "three");
        music_.write("four.mp3", "4");
        player.write("Music/foreign.mp3", "not ours");
        music_.list({"one.mp3", "two.mp3"});
        EXPECT_EQ(observedSync(wishFor(music_, player), [](const Step&) {}).kind, Kind::Sent);
        music_.list({"three.mp3", "two.mp3", "four.mp3"});
    }

    /// Syncs and gives back the steps.
    Steps stepsOfSync(const Player& player) {
        Steps steps;
        EXPECT_EQ(
            observedSync(wishFor(music_, player), [&](const Step& step) { steps.push_back(step); })
                .kind,
            Kind::Sent);
        return steps;
    }

    std::uint64_t copiedBySync() {
        std::uint64_t copied = 0;
        std::optional<std::uint64_t> before;
        const auto outcome = observedSync(
            wishFor(music_, player_), [](const Step&) {},
            [&](const auto& step) {
                before = before.value_or(step.songs);
                copied = step.songs - *before;
            });
        EXPECT_EQ(outcome.kind, Kind::Sent) << engine::sentence(outcome.message);
        return copied;
    }

    /// Syncs; the first step of this kind fails.
    Outcome syncFailing(const std::string& operation, const std::string& file, int error) {
        bool hasFailed = false;
        auto outcome = observedSync(wishFor(music_, player_), [&](const Step& step) {
            if (step.operation == operation && step.file == file &&
                !std::exchange(hasFailed, true)) {
                fail(error);
            }
        });
        EXPECT_TRUE(hasFailed) << "no step was tested";
        return outcome;
    }

    Music music_;
    Player player_;
    const Contents expected_{
        {"foreign.mp3", "not ours"},
        {"two.mp3", "two two"},
        {"three.mp3", "three"},
        {"four.mp3", "4"},
        {"List.m3u8", "#EXTM3U\n#PLAYLIST:List\nthree.mp3\ntwo.mp3\nfour.mp3\n"}};
};

bool isInMusic(const Step& step) { return step.file.starts_with("Music/"); }

bool changesNames(const Step& step) {
    return isInMusic(step) && (step.operation == "rename" || step.operation == "remove");
}

bool isClaim(const Step& step) {
    return step.operation == "write" && step.file.starts_with(".quorl/") &&
           step.detail.find("\"sent\"") != std::string::npos;
}

bool isListWritten(const Step& step) {
    return step.operation == "write" && step.file.starts_with(".quorl/");
}

Step waitFor(const std::string& file) { return {"fsync", file, ""}; }

bool isSame(const Step& first, const Step& second) {
    return first.operation == second.operation && first.file == second.file;
}

auto find(const Steps& steps, const Step& wanted) {
    return std::ranges::find_if(steps, [&](const Step& step) { return isSame(step, wanted); });
}

TEST_F(Durability, NoFileGetsItsNameBeforeItsContentsAreThere) {
    const auto steps = stepsOfSync(player_);

    int renames = 0;
    for (auto at = steps.begin(); at != steps.end(); ++at) {
        if (at->operation == "rename") {
            ++renames;
            const Steps before(std::make_reverse_iterator(at), steps.rend());
            const auto written = find(before, {"write", at->file, ""});
            const auto synced = find(before, {"sync", "", ""});
            EXPECT_LT(synced, written) << at->detail;
            EXPECT_TRUE(Device::isUnfinished(at->file.substr(std::string_view("Music/").size())))
                << at->file;
        }
    }
    EXPECT_EQ(renames, 3) << "two songs and the playlist";
}

TEST_F(Durability, NothingIsClaimedBeforeAllOfItIsThere) {
    const auto steps = stepsOfSync(player_);

    const auto claim = std::ranges::find_if(steps, isClaim);
    ASSERT_NE(claim, steps.end());
    const Steps before(std::make_reverse_iterator(claim), steps.rend());
    const auto changed = std::ranges::find_if(before, changesNames);
    EXPECT_LT(find(before, waitFor("Music/")), find(before, {"sync", "", ""}));
    EXPECT_LT(find(before, {"sync", "", ""}), changed);
    EXPECT_TRUE(std::none_of(claim, steps.end(), changesNames));
}

TEST_F(Durability, TheClaimIsWithdrawnBeforeAnythingOfItIsChanged) {
    const auto steps = stepsOfSync(player_);

    const auto written = std::ranges::find_if(steps, isListWritten);
    ASSERT_NE(written, steps.end());
    EXPECT_FALSE(isClaim(*written));
    EXPECT_TRUE(std::none_of(steps.begin(), written, changesNames));
    const auto next = std::find_if(written, steps.end(), changesNames);
    const Steps between(written, next);
    EXPECT_LT(find(between, waitFor(written->file)), between.end());
    EXPECT_LT(find(between, waitFor(".quorl/")), between.end());
}

TEST_F(Durability, NothingIsRenamedOverAnythingAndOnlyTheOlderListIsWritten) {
    auto steps = stepsOfSync(player_);

    EXPECT_LT(find(steps, {"remove", "Music/List.m3u8", ""}),
              std::ranges::find(steps, "List.m3u8", &Step::detail));
    std::erase_if(steps, [](const Step& step) { return !isListWritten(step); });
    ASSERT_GE(steps.size(), 3);
    for (std::size_t at = 1; at < steps.size(); ++at) {
        EXPECT_NE(steps[at].file, steps[at - 1].file);
    }
}

TEST_F(Durability, TheDirectoryAboveIsMadeDurableWhereOursAreNew) {
    const Player fresh;

    const auto steps = stepsOfSync(fresh);

    EXPECT_LT(find(steps, waitFor("/")), std::ranges::find_if(steps, isListWritten));
    EXPECT_EQ(std::ranges::count(stepsOfSync(player_), "/", &Step::file), 0);
}

class FailingOnce : public Durability, public ::testing::WithParamInterface<int> {};

/// Each step of a sync fails in turn, with a sync afterwards in which nothing does.
TEST_P(FailingOnce, NothingIsLostWhicheverStepFailsAndTheNextSyncMendsIt) {
    const std::size_t steps = stepsOfSync(player_).size();
    for (std::size_t failing = 0; failing < steps; ++failing) {
        Player player;
        prepare(player);
        const auto before = player.music();
        const auto wish = wishFor(music_, player);
        std::size_t at = 0;
        Step failed;

        const auto outcome = observedSync(wish, [&](const Step& step) {
            if (at++ == failing) {
                failed = step;
                fail(GetParam());
            }
        });

        const auto where = failed.operation + " " + failed.file;
        EXPECT_EQ(whatIsWrongWith(player.path()), "") << where;
        const auto sent = player.manifest().sent;
        EXPECT_TRUE(sent == wish.selection || outcome.kind != Kind::Sent) << where;
        if (sent) {
            EXPECT_EQ(player.music(), *sent == wish.selection ? expected_ : before) << where;
        }
        EXPECT_EQ(player.music().at("foreign.mp3"), "not ours") << where;
        const auto after = observedSync(wishFor(music_, player), [](const Step&) {});
        ASSERT_EQ(after.kind, Kind::Sent) << where << ": " << engine::sentence(after.message);
        ASSERT_EQ(player.music(), expected_) << where;
    }
}

INSTANTIATE_TEST_SUITE_P(Error, FailingOnce, ::testing::Values(EIO, ENOSPC, EROFS, ESTALE));

TEST_F(Durability, ACopyThatOnceCouldNotBeMadeDurableIsMadeAnew) {
    bool isWritten = false;
    const auto outcome = observedSync(wishFor(music_, player_), [&](const Step& step) {
        if (step.operation == "sync" && std::exchange(isWritten, false)) {
            fail(EIO);
        }
        isWritten = isWritten || isSame(step, {"write", "Music/QUORL001.TMP", ""});
    });
    EXPECT_EQ(outcome.kind, Kind::Failed);
    EXPECT_THAT(player_.music(), Not(Contains(Key("QUORL001.TMP"))));

    EXPECT_EQ(copiedBySync(), 2);
    EXPECT_EQ(player_.music(), expected_);
}

TEST_F(Durability, AGroupThatOnceCouldNotBeMadeDurableIsCopiedAnew) {
    bool isRenamed = false;
    const auto outcome = observedSync(wishFor(music_, player_), [&](const Step& step) {
        if (step.operation == "sync" && std::exchange(isRenamed, false)) {
            fail(EIO);
        }
        isRenamed = isRenamed || step.detail == "three.mp3";
    });
    EXPECT_EQ(outcome.kind, Kind::Failed);
    EXPECT_THAT(player_.music(), Not(Contains(Key("three.mp3"))));

    EXPECT_EQ(copiedBySync(), 2);
    EXPECT_EQ(player_.music(), expected_);
}

TEST_F(Durability, AListIsOnlyWrittenUnderANameThatThisSyncHasMadeDurable) {
    for (int round = 0; round < 2; ++round) {
        auto steps = stepsOfSync(player_);
        music_.list({round == 0 ? "one.mp3" : "two.mp3"});
        std::erase_if(steps, [](const Step& step) { return !step.file.starts_with(".quorl/man"); });
        for (const auto* const file : {".quorl/manifest.1", ".quorl/manifest.2"}) {
            const auto first = find(steps, {"remove", file, ""});
            EXPECT_LT(first, find(steps, {"create", file, ""})) << file;
            EXPECT_LT(find(steps, {"create", file, ""}), find(steps, waitFor(file))) << file;
            EXPECT_LT(find(steps, waitFor(file)), find(steps, {"write", file, ""})) << file;
        }
    }
}

TEST_F(Durability, WhatAKilledSyncHasLeftCountsOnlyWhereItCanBeMadeDurable) {
    const auto kill = [this] {
        bool isDead = false;
        bool isNamed = false;
        const auto outcome = observedSync(wishFor(music_, player_), [&](const Step& step) {
            isDead = isDead || (isNamed && step.operation == "sync");
            isNamed = isNamed || step.detail == "four.mp3";
            if (isDead) {
                fail(ENODEV);
            }
        });
        EXPECT_EQ(outcome.kind, Kind::Failed);
        EXPECT_EQ(player_.music().at("three.mp3"), "three");
    };
    kill();
    EXPECT_EQ(syncFailing("sync", "", EIO).kind, Kind::Failed);
    EXPECT_THAT(player_.music(), Not(Contains(Key("three.mp3"))));
    EXPECT_THAT(player_.music(), Contains(Key("one.mp3"))) << "it was durable long ago";

    kill();
    EXPECT_EQ(copiedBySync(), 0);
    EXPECT_EQ(player_.music(), expected_);
}

TEST_F(Durability, WhatWasRemovedIsRemovedOnceMoreWhereThatCouldNotBeMadeDurable) {
    static_cast<void>(stepsOfSync(player_));
    music_.list({"two.mp3"});
    Steps steps;
    bool isRemoved = false;
    const auto outcome = observedSync(wishFor(music_, player_), [&](const Step& step) {
        steps.push_back(step);
        if (step.operation == "sync" && std::exchange(isRemoved, false)) {
            fail(EIO);
        }
        isRemoved = isRemoved || isSame(step, {"remove", "Music/three.mp3", ""});
    });

    EXPECT_EQ(outcome.kind, Kind::Failed);
    const auto again = find(steps, {"create", "Music/three.mp3", ""});
    ASSERT_NE(again, steps.end());
    EXPECT_TRUE(isSame(*std::next(again), {"remove", "Music/three.mp3", ""}));
    EXPECT_THAT(player_.music(), Not(Contains(Key("three.mp3"))));
}

TEST_F(Durability, NamesThatOnceCouldNotBeMadeDurableAreGivenAnew) {
    EXPECT_EQ(syncFailing("fsync", "Music/", EIO).kind, Kind::Failed);
    EXPECT_THAT(player_.music(), Not(Contains(Key("three.mp3"))));

    EXPECT_EQ(copiedBySync(), 2);
    EXPECT_EQ(player_.music(), expected_);
}

TEST_F(Durability, AListThatOnceCouldNotBeMadeDurableIsWrittenToTheSameFileAgain) {
    std::vector<std::string> written;
    std::string removed;
    bool hasFailed = false;
    const auto outcome = observedSync(wishFor(music_, player_), [&](const Step& step) {
        if (isListWritten(step)) {
            written.push_back(step.file);
        } else if (step.operation == "remove" && hasFailed && removed.empty()) {
            removed = step.file;
        } else if (step.operation == "fsync" && step.file == ".quorl/" && !written.empty() &&
                   !std::exchange(hasFailed, true)) {
            fail(EIO);
        }
    });

    EXPECT_EQ(outcome.kind, Kind::Failed);
    ASSERT_GE(written.size(), 2);
    EXPECT_EQ(written[0], written[1]);
    EXPECT_EQ(written[0], removed) << "the next sync must not take it for durable either";
    EXPECT_EQ(copiedBySync(), 2);
}

TEST_F(Durability, WhatASongTooLargeHasLeftIsRemovedAtOnce) {
    Steps steps;
    bool hasFailed = false;
    const auto outcome = observedSync(wishFor(music_, player_), [&](const Step& step) {
        steps.push_back(step);
        if (step.operation == "write" && isInMusic(step) && !std::exchange(hasFailed, true)) {
            fail(EFBIG);
        }
    });

    EXPECT_EQ(outcome.kind, Kind::Failed);
    EXPECT_THAT(engine::sentence(outcome.message),
                HasSubstr("larger than a file on the Velora can be"));
    const auto failed = find(steps, {"write", "Music/QUORL001.TMP", ""});
    ASSERT_NE(failed, steps.end());
    EXPECT_TRUE(isSame(*std::next(failed), {"remove", "Music/QUORL001.TMP", ""}));
}

TEST_F(Durability, ANameThatIsTakenThoughNobodySeesItIsLeftToItsOwner) {
    const auto outcome = observedSync(wishFor(music_, player_), [](const Step& step) {
        if (step.detail == "three.mp3" || step.detail == "three (2).mp3" ||
            step.detail == "List.m3u8") {
            fail(EEXIST);
        }
    });

    EXPECT_EQ(outcome.kind, Kind::Sent) << engine::sentence(outcome.message);
    EXPECT_EQ(player_.music().at("three (3).mp3"), "three");
    EXPECT_EQ(player_.music().at("List (2).m3u8"),
              "#EXTM3U\n#PLAYLIST:List\nthree (3).mp3\ntwo.mp3\nfour.mp3\n");
    EXPECT_TRUE(player_.manifest().strays.empty());
}

TEST_F(Durability, LeftoversAreRemovedAndFilesOfLikeNamesAreNot) {
    player_.write("Music/QUORL001.TMP", "half a so");
    player_.write("Music/quorl1000.tmp", "half a so");
    player_.write("Music/QUORLOGY.TMP", "not ours");

    EXPECT_EQ(copiedBySync(), 2);

    auto expected = expected_;
    expected["QUORLOGY.TMP"] = "not ours";
    EXPECT_EQ(player_.music(), expected);
}

TEST_F(Durability, ALeftoverThatMayBeASecondNameOfASongIsLeft) {
    std::filesystem::create_hard_link(player_.path() / "Music/two.mp3",
                                      player_.path() / "Music/QUORL001.TMP");

    EXPECT_EQ(copiedBySync(), 2);

    auto expected = expected_;
    expected["QUORL001.TMP"] = "two two";
    EXPECT_EQ(player_.music(), expected);
}

TEST_F(Durability, ASongOfSomebodyElseInThePlaceOfOursIsKeptThoughItIsAsLarge) {
    player_.write("Music/one.mp3", "eno");
    player_.write("Music/two.mp3", "owt owt");
    player_.write("Music/List.m3u8",
                  std::string(textOf(player_.path() / "Music/List.m3u8").size(), '#'));
    const auto theirs = player_.music();

    EXPECT_EQ(copiedBySync(), 3);

    for (const auto& [name, text] : theirs) {
        EXPECT_EQ(player_.music().at(name), text) << name;
    }
    EXPECT_EQ(player_.music().at("two (2).mp3"), "two two");
    EXPECT_EQ(player_.music().at("List (2).m3u8"),
              "#EXTM3U\n#PLAYLIST:List\nthree.mp3\ntwo (2).mp3\nfour.mp3\n");
}

TEST_F(Durability, ASongOfSomebodyElseThatComesWhileASyncIsUnderWayIsKept) {
    const auto outcome = observedSync(wishFor(music_, player_), [this](const Step& step) {
        if (step.operation == "rename") {
            player_.write("Music/one.mp3", "eno");
        }
    });

    EXPECT_EQ(outcome.kind, Kind::Sent) << engine::sentence(outcome.message);
    EXPECT_EQ(player_.music().at("one.mp3"), "eno");
}

TEST_F(Durability, FilesAreForTheirOwner) {
    static_cast<void>(stepsOfSync(player_));
    base::FileStatus song{};
    base::FileStatus own{};
    ASSERT_EQ(stat((player_.path() / "Music/three.mp3").c_str(), &song), 0);
    ASSERT_EQ(stat((player_.path() / ".quorl").c_str(), &own), 0);

    EXPECT_EQ(song.st_mode & ACCESSPERMS, 0600);
    EXPECT_EQ(own.st_mode & ACCESSPERMS, 0700);
}

class DamagedList : public Durability, public ::testing::WithParamInterface<const char*> {};

TEST_P(DamagedList, CostsNothingWhileTheOtherOneIsWhole) {
    static_cast<void>(stepsOfSync(player_));
    const auto list = player_.path() / ".quorl" / GetParam();
    std::filesystem::resize_file(list, std::filesystem::file_size(list) / 2);

    EXPECT_EQ(copiedBySync(), 0);

    EXPECT_EQ(player_.music(), expected_);
    EXPECT_EQ(player_.manifest().sent, wishFor(music_, player_).selection);
}

INSTANTIATE_TEST_SUITE_P(File, DamagedList, ::testing::ValuesIn(wearable::generationFiles));

TEST_F(Durability, AWearableWithBothListsDamagedIsNotTouched) {
    for (const auto* const file : wearable::generationFiles) {
        player_.write(std::string(".quorl/") + file, "damaged");
    }
    const auto before = contentsOf(player_.path());

    const auto outcome = observedSync(wishFor(music_, player_), [](const Step&) {});

    EXPECT_EQ(outcome.kind, Kind::Failed);
    EXPECT_THAT(engine::sentence(outcome.message), HasSubstr("Remove the files .quorl/manifest.*"));
    EXPECT_EQ(contentsOf(player_.path()), before);
}

TEST_F(Durability, AListOfTheTimeBeforeIsTakenOver) {
    const auto manifest = player_.manifest();
    std::filesystem::remove_all(player_.path() / ".quorl");
    player_.write(".quorl/manifest.json", toText(manifest));

    EXPECT_EQ(copiedBySync(), 2);

    EXPECT_EQ(player_.music(), expected_);
    EXPECT_THAT(contentsOf(player_.path() / ".quorl"), Not(Contains(Key("manifest.json"))));
}

/// A wearable of a megabyte, most of which an old song takes.
class FullWearable : public ::testing::Test {
  protected:
    FullWearable() {
        music_.write("old.mp3", std::string(900'000, 'o'));
        music_.write("new.mp3", std::string(800'000, 'n'));
        music_.write("small.mp3", "small");
        music_.list({"old.mp3", "small.mp3"});
        EXPECT_EQ(sync(wishFor(music_, player_)).kind, Kind::Sent);
    }

    Music music_;
    Player player_{1 << 20};
};

TEST_F(FullWearable, GetsAnotherChoiceInThePlaceOfTheOldOne) {
    music_.list({"new.mp3", "small.mp3"});
    Steps steps;

    const auto outcome =
        observedSync(wishFor(music_, player_), [&](const Step& step) { steps.push_back(step); });

    EXPECT_EQ(outcome.kind, Kind::Sent) << engine::sentence(outcome.message);
    EXPECT_EQ(player_.music(),
              (Contents{{"new.mp3", std::string(800'000, 'n')},
                        {"small.mp3", "small"},
                        {"List.m3u8", "#EXTM3U\n#PLAYLIST:List\nnew.mp3\nsmall.mp3\n"}}));
    const auto withdrawn = std::ranges::find_if(steps, isListWritten);
    const auto playlist = find(steps, {"remove", "Music/List.m3u8", ""});
    const auto settled = std::find_if(
        playlist, steps.cend(), [](const auto& step) { return isSame(step, waitFor("Music/")); });
    EXPECT_LT(withdrawn, playlist);
    EXPECT_LT(settled, find(steps, {"remove", "Music/old.mp3", ""}));
}

TEST_F(FullWearable, LosesNoSongBeforeItsPlaylistAlsoAfterASyncThatWasCutOff) {
    music_.list({"new.mp3", "small.mp3"});
    const auto cutOff = observedSync(wishFor(music_, player_), [](const Step& step) {
        if (step.operation == "remove") {
            fail(EIO);
        }
    });
    EXPECT_EQ(cutOff.kind, Kind::Failed);
    Steps steps;

    const auto outcome =
        observedSync(wishFor(music_, player_), [&](const Step& step) { steps.push_back(step); });

    EXPECT_EQ(outcome.kind, Kind::Sent) << engine::sentence(outcome.message);
    EXPECT_LT(find(steps, {"remove", "Music/List.m3u8", ""}),
              find(steps, {"remove", "Music/old.mp3", ""}));
}

TEST_F(FullWearable, IsNotTouchedWhereEvenThenThereIsNoRoom) {
    music_.write("large.mp3", std::string(2'000'000, 'l'));
    music_.list({"large.mp3"});
    const auto before = contentsOf(player_.path());

    const auto outcome = sync(wishFor(music_, player_));

    EXPECT_THAT(engine::sentence(outcome.message),
                HasSubstr("has not enough space: 2 MB are needed"));
    EXPECT_EQ(contentsOf(player_.path()), before);
}

} // namespace
