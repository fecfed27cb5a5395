// What a simulated disk keeps when it loses power: everything that was made durable, and of the
// rest each part in some life or other, by the rules of its file system.

#include "quorl-simulate/parts/SimulatedDisk.h"

#include <set>
#include <system_error>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

namespace {

using namespace quorl::simulation;
using testing::Contains;
using testing::ElementsAre;
using testing::IsEmpty;
using testing::IsSupersetOf;
using testing::Not;

constexpr auto top = SimulatedDisk::top;
constexpr std::uint64_t lives = 400;

SimulatedDisk disk(DiskRules rules) { return {rules, 10'000, 1'000}; }

std::string contents(const SimulatedDisk& disk, std::string_view name) {
    const auto node = disk.find(top, name);
    return node ? disk.read(*node) : "(no file)";
}

/// What is left of a file in each of many lives in which `use` was followed by a loss of power.
template <class Use>
std::set<std::string> remains(DiskRules rules, std::string_view name, Use use) {
    std::set<std::string> found;
    for (std::uint64_t seed = 0; seed < lives; ++seed) {
        auto each = disk(rules);
        use(each);
        Random random(seed);
        each.losePower(random);
        found.insert(contents(each, name));
    }
    return found;
}

/// The names that are left in each of many lives.
template <class Use>
std::set<std::vector<std::string>> namesLeft(DiskRules rules, Use use) {
    std::set<std::vector<std::string>> found;
    for (std::uint64_t seed = 0; seed < lives; ++seed) {
        auto each = disk(rules);
        use(each);
        Random random(seed);
        each.losePower(random);
        found.insert(each.names(top));
    }
    return found;
}

int errorOf(const std::function<void()>& act) {
    try {
        act();
    } catch (const std::system_error& error) {
        return error.code().value();
    }
    return 0;
}

class AnyDisk : public testing::TestWithParam<DiskRules> {};

INSTANTIATE_TEST_SUITE_P(Rules, AnyDisk, testing::Values(DiskRules::Posix, DiskRules::Fat));

TEST_P(AnyDisk, KeepsAFileThatWasMadeDurableWithItsName) {
    const auto found = remains(GetParam(), "song", [](SimulatedDisk& each) {
        const auto song = each.create(top, "song");
        each.append(song, "la la la, la la la");
        each.sync(song);
        each.sync(top);
    });

    EXPECT_THAT(found, ElementsAre("la la la, la la la"));
}

TEST_P(AnyDisk, KeepsEverythingThatWasMadeDurableAtOnce) {
    const auto found = remains(GetParam(), "renamed", [](SimulatedDisk& each) {
        const auto song = each.create(top, "song");
        each.append(song, "la la la, la la la");
        each.rename(top, "song", top, "renamed");
        each.syncAll();
    });

    EXPECT_THAT(found, ElementsAre("la la la, la la la"));
}

TEST_P(AnyDisk, MayLoseANameWhoseDirectoryWasNotMadeDurable) {
    const auto found = remains(GetParam(), "song", [](SimulatedDisk& each) {
        const auto song = each.create(top, "song");
        each.append(song, "la la la");
        each.sync(song);
    });

    EXPECT_THAT(found, Contains("(no file)"));
    EXPECT_THAT(found, Contains("la la la"));
}

TEST_P(AnyDisk, MayKeepTheSizeOfAFileAndPiecesOfIt) {
    const auto found = remains(GetParam(), "song", [](SimulatedDisk& each) {
        const auto song = each.create(top, "song");
        each.sync(song);
        each.sync(top);
        each.append(song, "12345678abcdefgh");
    });

    EXPECT_THAT(found, Contains(""));
    EXPECT_THAT(found, Contains("12345678abcdefgh"));
    EXPECT_THAT(found, Contains(std::string(16, '\0'))) << "a size without data";
    EXPECT_THAT(found, Contains("12345678" + std::string(8, '\0')));
}

TEST_P(AnyDisk, LosesWhatAFailedSyncWasToMakeDurableThoughTheNextOneGoesWell) {
    const auto found = remains(GetParam(), "song", [](SimulatedDisk& each) {
        const auto song = each.create(top, "song");
        each.sync(song);
        each.sync(top);
        each.append(song, "12345678");
        EXPECT_EQ(errorOf([&] { each.failSync(song); }), EIO);
        each.sync(song);
    });

    EXPECT_THAT(found, Contains(Not("12345678")));
}

TEST_P(AnyDisk, LosesAllThatWasNotDurableWhenNotEverythingCouldBeMadeSo) {
    const auto use = [](SimulatedDisk& each) {
        each.append(each.create(top, "old"), "la la la");
        each.syncAll();
        each.append(each.create(top, "song"), "12345678");
        each.remove(top, "old");
        EXPECT_EQ(errorOf([&] { each.failSyncAll(); }), EIO);
        each.syncAll();
    };

    EXPECT_THAT(remains(GetParam(), "song", use), ElementsAre("(no file)"));
    EXPECT_THAT(remains(GetParam(), "old", use), ElementsAre("la la la"));
}

TEST_P(AnyDisk, KeepsWhatWasMadeAnewAfterNotEverythingCouldBeMadeDurable) {
    const auto found = remains(GetParam(), "song", [](SimulatedDisk& each) {
        each.append(each.create(top, "song"), "12345678");
        EXPECT_EQ(errorOf([&] { each.failSyncAll(); }), EIO);
        each.remove(top, "song");
        each.append(each.create(top, "song"), "12345678");
        each.syncAll();
        EXPECT_TRUE(each.isDurable(top, "song"));
    });

    EXPECT_THAT(found, ElementsAre("12345678"));
}

TEST_P(AnyDisk, HasADirectoryOnlyWhenItsOwnNameIsDurable) {
    const auto found = namesLeft(GetParam(), [](SimulatedDisk& each) {
        const auto music = each.makeDirectory(top, "Music");
        const auto song = each.create(music, "song");
        each.sync(song);
        each.sync(music);
    });

    EXPECT_THAT(found, Contains(IsEmpty()));
}

TEST_P(AnyDisk, FailsAsSystemCallsDo) {
    auto each = disk(GetParam());
    const auto song = each.create(top, "song");

    EXPECT_EQ(errorOf([&] { (void)each.create(top, "song"); }), EEXIST);
    EXPECT_EQ(errorOf([&] { each.remove(top, "other"); }), ENOENT);
    EXPECT_EQ(errorOf([&] { each.append(song, std::string(1'001, 'x')); }), EFBIG);
    each.setSpaceOfOthers(9'990);
    EXPECT_EQ(errorOf([&] { each.append(song, std::string(11, 'x')); }), ENOSPC);
    EXPECT_EQ(each.available(), 10);
    each.setReadOnly(true);
    EXPECT_EQ(errorOf([&] { each.append(song, "x"); }), EROFS);
    EXPECT_EQ(contents(each, "song"), "");
}

TEST_P(AnyDisk, AsksBeforeEachOperation) {
    auto each = disk(GetParam());
    each.setBefore([](std::string_view operation, std::string_view name) {
        if (operation == "create" && name == "song") {
            throw std::system_error(EIO, std::generic_category());
        }
    });

    EXPECT_EQ(errorOf([&] { (void)each.create(top, "song"); }), EIO);
    EXPECT_THAT(each.names(top), IsEmpty());
}

TEST_P(AnyDisk, KnowsAllThatAFileMayHoldInFullAfterALossOfPower) {
    auto each = disk(GetParam());
    const auto file = each.create(top, "file");
    each.append(file, "old");
    each.syncAll();
    each.truncate(file);
    each.append(file, "new");
    each.remove(top, "file");
    each.append(each.create(top, "file"), "newest");

    EXPECT_THAT(each.possibleContents(top, "file"), IsSupersetOf({"old", "new", "newest"}));
    EXPECT_THAT(each.possibleContents(top, "other"), IsEmpty());
}

TEST(PosixDisk, HasOneNameAfterARenameWhetherItWasKeptOrNot) {
    const auto found = namesLeft(DiskRules::Posix, [](SimulatedDisk& each) {
        each.sync(each.create(top, "before"));
        each.sync(top);
        each.rename(top, "before", top, "after");
    });

    EXPECT_THAT(found, ElementsAre(ElementsAre("after"), ElementsAre("before")));
}

TEST(FatDisk, HasAnyOfBothNamesAfterARenameThatWasCutShort) {
    const auto found = namesLeft(DiskRules::Fat, [](SimulatedDisk& each) {
        each.sync(each.create(top, "before"));
        each.sync(top);
        each.rename(top, "before", top, "after");
    });

    EXPECT_THAT(found, ElementsAre(IsEmpty(), ElementsAre("after"), ElementsAre("after", "before"),
                                   ElementsAre("before")));
}

/// Makes a file durable and then gives it another name, which is made durable in its directory
/// only.
void renameSong(SimulatedDisk& disk) {
    const auto song = disk.create(top, "before");
    disk.append(song, "la la la");
    disk.sync(song);
    disk.rename(top, "before", top, "after");
    disk.sync(top);
}

TEST(FatDisk, MayForgetTheContentsOfAFileThatWasNotMadeDurableUnderItsNewName) {
    const auto found = remains(DiskRules::Fat, "after", renameSong);

    EXPECT_THAT(found, ElementsAre("", "la la la"));
}

TEST(FatDisk, MayForgetTheContentsOfAFileWhoseNewNameOnceCouldNotBeMadeDurable) {
    const auto found = remains(DiskRules::Fat, "after", [](SimulatedDisk& each) {
        renameSong(each);
        EXPECT_EQ(errorOf([&] { each.failSyncAll(); }), EIO);
        each.syncAll();
    });

    EXPECT_THAT(found, ElementsAre("", "la la la"));
}

TEST(FatDisk, KeepsAFileThatWasMadeDurableUnderItsNewName) {
    const auto found = remains(DiskRules::Fat, "after", [](SimulatedDisk& each) {
        const auto song = each.create(top, "before");
        each.append(song, "la la la");
        each.rename(top, "before", top, "after");
        each.sync(song);
        each.sync(top);
    });

    EXPECT_THAT(found, ElementsAre("la la la"));
}

TEST(FatDisk, GivesTheClustersOfAFileAwayWithTheFirstOfTwoNamesThatWereLeftForIt) {
    bool hadBothNames = false;
    for (std::uint64_t seed = 0; seed < lives && !hadBothNames; ++seed) {
        auto each = disk(DiskRules::Fat);
        const auto song = each.create(top, "before");
        each.append(song, "la la la");
        each.sync(song);
        each.sync(top);
        each.rename(top, "before", top, "after");
        each.sync(song);
        Random random(seed);
        each.losePower(random);
        if (each.names(top).size() == 2 && contents(each, "after") == "la la la") {
            hadBothNames = true;
            EXPECT_EQ(each.find(top, "after"), each.find(top, "before"));
            EXPECT_TRUE(each.isShared(top, "after"));
            each.remove(top, "before");
            EXPECT_FALSE(each.isShared(top, "after"));
            EXPECT_NE(contents(each, "after"), "la la la");
        }
    }
    EXPECT_TRUE(hadBothNames);
}

TEST(FatDisk, TakesNamesThatDifferInCaseOrAreAnAliasForOne) {
    auto each = disk(DiskRules::Fat);
    const auto song = each.create(top, "Some very long name.mp3");

    EXPECT_EQ(each.find(top, "some VERY long name.MP3"), song);
    EXPECT_EQ(each.find(top, "SOMEVE~1.MP3"), song);
    EXPECT_EQ(errorOf([&] { (void)each.create(top, "someve~1.mp3"); }), EEXIST);
    each.remove(top, "SOMEVE~1.MP3");
    EXPECT_THAT(each.names(top), IsEmpty());
}

TEST(FatDisk, KeepsTimesToTwoSeconds) {
    auto each = disk(DiskRules::Fat);
    const auto song = each.create(top, "song");
    each.setModified(song, 5'500'000'000);

    EXPECT_EQ(each.status(song).modified, 4'000'000'000);
}

} // namespace
