// The rules let a sync pass as it is, and find whatever is left out of it or put elsewhere.

#include "tests/engine/calls/VolumeRules.h"

#include <algorithm>
#include <functional>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "quorl-simulate/parts/SimulatedVolume.h"
#include "tests/engine/Folders.h"
#include "tests/engine/transfer/ObservedVolume.h"

namespace {

using namespace quorl;
using namespace quorl::syncd;
using namespace quorl::syncd::testing;
using ::testing::HasSubstr;
using ::testing::IsEmpty;
using Kind = Outcome::Kind;

/// A first sync, a changed choice, and the same songs in another order; on any volume.
class ThreeSyncs {
  public:
    explicit ThreeSyncs(std::function<std::unique_ptr<Volume>()> open) {
        const auto openObserved = [&](const auto& /*wearable*/) {
            return std::make_unique<ObservedVolume>(
                open(), [this](const Step& step) { steps_.push_back(step); });
        };
        Music music;
        for (const auto* name : {"one.mp3", "two.mp3", "three.mp3"}) {
            music.write(name, name);
        }
        for (const auto& songs : std::vector<std::vector<std::string>>{
                 {"one.mp3", "two.mp3"}, {"two.mp3", "three.mp3"}, {"three.mp3", "two.mp3"}}) {
            music.list(songs);
            EXPECT_EQ(sync(wishFor(music, Player()), {}, {}, openObserved).kind, Kind::Sent);
        }
    }

    [[nodiscard]] const Steps& steps() const { return steps_; }

  private:
    Steps steps_;
};

Steps stepsOnRealFiles() {
    const Player player;
    return ThreeSyncs([&] { return openPosixVolume(player.wearable()); }).steps();
}

TEST(VolumeRules, AreKeptOnRealFiles) { EXPECT_THAT(firstBreach(stepsOnRealFiles()), IsEmpty()); }

TEST(VolumeRules, AreKeptOnASimulatedDiskByTheSameSteps) {
    simulation::SimulatedDisk disk(simulation::DiskRules::Posix, 1 << 20, 1 << 20);
    const ThreeSyncs simulated([&] { return std::make_unique<simulation::SimulatedVolume>(disk); });

    EXPECT_THAT(firstBreach(simulated.steps()), IsEmpty());
    const auto isSame = [](const Step& first, const Step& second) {
        return first.operation == second.operation && first.file == second.file;
    };
    EXPECT_TRUE(std::ranges::equal(simulated.steps(), stepsOnRealFiles(), isSame));
}

bool isClaim(const Step& step) { return step.detail.find("\"sent\"") != std::string::npos; }

auto is(const std::string& operation, const std::string& file) {
    return [=](const Step& step) {
        return step.operation == operation && (file == "*" || step.file == file);
    };
}

struct Planted {
    const char* name;
    std::function<void(Steps&)> plant;
    const char* breach;

    friend std::ostream& operator<<(std::ostream& stream, const Planted& planted) {
        return stream << planted.breach;
    }
};

/// Lets a good sync go wrong in one way.
class PlantedBreach : public ::testing::TestWithParam<Planted> {};

TEST_P(PlantedBreach, IsFound) {
    auto steps = stepsOnRealFiles();

    GetParam().plant(steps);

    EXPECT_THAT(firstBreach(steps), HasSubstr(GetParam().breach));
}

std::function<void(Steps&)> without(std::function<bool(const Step&)> isLeftOut) {
    return [isLeftOut](Steps& steps) { std::erase_if(steps, isLeftOut); };
}

std::function<void(Steps&)> at(std::function<bool(const Step&)> isPlace, Step step) {
    return [=](Steps& steps) { steps.insert(std::ranges::find_if(steps, isPlace), step); };
}

void removeAfterTheClaim(Steps& steps) {
    const auto claim = std::ranges::find_if(steps, isClaim);
    const auto durable = std::find_if(claim, steps.end(), is("fsync", ".quorl/"));
    steps.insert(durable + 1, {"remove", "Music/one.mp3", ""});
}

void keepTheFirstPlaylist(Steps& steps) {
    bool isFirst = true;
    std::erase_if(steps, is("remove", "Music/List.m3u8"));
    std::erase_if(steps, [&](const Step& step) {
        return step.detail == "List.m3u8" && !std::exchange(isFirst, false);
    });
}

void writeOverTheNewestList(Steps& steps) {
    const auto begin = std::ranges::find(steps, "overwrite", &Step::operation);
    std::for_each(begin, steps.end(), [](Step& step) {
        if (step.file.starts_with(".quorl/manifest.")) {
            step.file.back() = step.file.back() == '1' ? '2' : '1';
        }
    });
}

/// Before what it was to make durable.
void syncEarlier(Steps& steps) {
    const auto renamed = std::ranges::find_if(steps, is("rename", "*"));
    const auto synced =
        std::find_if(std::make_reverse_iterator(renamed), steps.rend(), is("sync", ""));
    steps.erase(std::prev(synced.base()));
}

INSTANTIATE_TEST_SUITE_P(
    Sync, PlantedBreach,
    ::testing::Values(
        Planted{"SongNotSynced", syncEarlier, "gets its name before its contents are durable"},
        Planted{"VolumeNotSynced",
                [](Steps& steps) {
                    const auto renamed = std::ranges::find_if(steps, is("rename", "*"));
                    steps.erase(std::remove_if(renamed, steps.end(), is("sync", "")), steps.end());
                },
                "before it is durable"},
        Planted{"NamesNotSynced", without(is("fsync", "Music/")), "before it is durable"},
        Planted{"TopNotSynced", without(is("fsync", "/")), "before its directory is durable"},
        Planted{"ListNotSynced", without(is("fsync", ".quorl/manifest.1")), "does not tell of"},
        Planted{"OwnNamesNotSynced",
                [](Steps& steps) {
                    const auto written = std::ranges::find_if(steps, is("write", "*"));
                    steps.erase(std::find_if(written, steps.end(), is("fsync", ".quorl/")));
                },
                "does not tell of"},
        Planted{"NewestListWrittenOver", writeOverTheNewestList, "the newest list is written over"},
        Planted{"NewestListRemoved",
                [](Steps& steps) {
                    for (auto& step : steps) {
                        step.file =
                            step.file == ".quorl/manifest.2" ? ".quorl/manifest.1" : step.file;
                    }
                },
                "the newest list is removed"},
        Planted{"ListDamaged",
                [](Steps& steps) { std::ranges::find_if(steps, isClaim)->detail.pop_back(); },
                "a list is not whole"},
        Planted{
            "NameOfListNotSynced",
            [](Steps& steps) { steps.erase(std::ranges::find_if(steps, is("fsync", ".quorl/"))); },
            "before its name is durable"},
        Planted{"TwoListsAtOnce", at(is("fsync", ".quorl/"), {"create", ".quorl/manifest.2", ""}),
                "before the other one is durable"},
        Planted{"RemovedBeforeTheNewList", removeAfterTheClaim,
                "while the list says that all was sent"},
        Planted{"RemovedWhileItPlays", keepTheFirstPlaylist,
                "a song is removed that a playlist names"},
        Planted{"SongOfOthersRemoved", at(is("remove", "*"), {"remove", "Music/foreign", ""}),
                "does not give up"},
        Planted{"NameNotAnnounced",
                [](Steps& steps) {
                    std::ranges::find_if(steps, is("rename", "*"))->detail = "surprise";
                },
                "does not tell of"},
        Planted{"WrittenInPlace",
                at(is("create", "Music/QUORL001.TMP"), {"create", "Music/one.mp3", ""}),
                "under a name that counts"},
        Planted{"WrittenElsewhere", at(is("sync", ""), {"create", "Photos/one", ""}),
                "a place that is not ours"},
        Planted{"Replaced", at(is("rename", "*"), {"renameat", "Music/QUORL001.TMP", ""}),
                "none of ours"}),
    [](const auto& planted) { return planted.param.name; });

} // namespace
