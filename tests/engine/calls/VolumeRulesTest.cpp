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

INSTANTIATE_TEST_SUITE_P(
    Sync, PlantedBreach,
    ::testing::Values(
        Planted{"SongNotSynced", without(is("fsync", "Music/QUORL001.TMP")),
                "gets its name before its contents are durable"},
        Planted{"VolumeNotSynced", without(is("sync", "")), "before it is durable"},
        Planted{"NamesNotSynced", without(is("fsync", "Music/")), "before it is durable"},
        Planted{"TopNotSynced", without(is("fsync", "/")), "before its directory is durable"},
        Planted{"ListNotSynced", without(is("fsync", ".quorl/manifest.1")), "does not tell of"},
        Planted{"OwnNamesNotSynced", without(is("fsync", ".quorl/")), "does not tell of"},
        Planted{"NewestListWrittenOver",
                [](Steps& steps) {
                    for (auto& step : steps) {
                        step.file =
                            step.file == ".quorl/manifest.2" ? ".quorl/manifest.1" : step.file;
                    }
                },
                "the newest list is written over"},
        Planted{"ListDamaged",
                [](Steps& steps) { std::ranges::find_if(steps, isClaim)->detail.pop_back(); },
                "a list is not whole"},
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
