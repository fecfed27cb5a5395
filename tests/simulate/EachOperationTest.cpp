// Four syncs, each cut short at every single operation, and each with every single operation
// failing: all promises are kept meanwhile, and in the end the wearable holds what is chosen.

#include <array>

#include <gtest/gtest.h>

#include "quorl-simulate/World.h"

namespace {

using namespace quorl::simulation;

/// What leads to a sync, and with what world it begins.
struct Story {
    const char* name;
    std::uint64_t seed;
    std::vector<Event> events;
};

void PrintTo(const Story& story, std::ostream* out) { *out << story.name; }

/// Long after everything before is done.
constexpr std::uint64_t later = 2'000;

const std::array stories{
    Story{"FirstSync", 4, {}},
    Story{"ChangedChoice", 4, {{Happening::Choose, later, 2}}},
    Story{"RemovedMusic", 4, {{Happening::RemoveMusic, later, 2}}},
    Story{"SameFilesInAnotherOrder", 4, {{Happening::ReorderList, later, 3}}},
};

using Each = std::tuple<Story, DiskRules>;

/// How many of the states that a loss of power may leave are tried.
constexpr std::uint64_t survivors = 8;

class EachOperation : public testing::TestWithParam<Each> {
  protected:
    [[nodiscard]] static Life life() {
        const auto& [story, rules] = GetParam();
        return {story.seed, rules, story.events, Plant::None};
    }

    [[nodiscard]] static LifeResult uncut() { return liveOnce(life()); }

    [[nodiscard]] static bool isAnyBroken(Plant plant) {
        auto cut = life();
        cut.plant = plant;
        cut.events.push_back({Happening::LosePower, 0, 0});
        const auto last = uncut().moments;
        for (std::uint64_t wait = 0; wait <= last; ++wait) {
            cut.events.back().wait = wait;
            for (cut.events.back().seed = 0; cut.events.back().seed < survivors;
                 ++cut.events.back().seed) {
                if (liveOnce(cut).breach) {
                    return true;
                }
            }
        }
        return false;
    }

    /// `after` follows the story, when `wait` operations and turns have passed.
    static void expectPeaceAfter(std::uint64_t wait, std::vector<Event> after) {
        auto cut = life();
        after.front().wait = wait;
        cut.events.insert(cut.events.end(), after.begin(), after.end());
        const auto breach = liveOnce(cut).breach;
        EXPECT_FALSE(breach) << toText(cut) << "\n" << breach->what << "\n" << breach->wearable;
    }
};

INSTANTIATE_TEST_SUITE_P(Syncs, EachOperation,
                         testing::Combine(testing::ValuesIn(stories),
                                          testing::Values(DiskRules::Posix, DiskRules::Fat)),
                         [](const auto& each) {
                             return std::string(std::get<0>(each.param).name) +
                                    (std::get<1>(each.param) == DiskRules::Posix ? "Posix" : "Fat");
                         });

TEST_P(EachOperation, ShowsByALossOfPowerWhatIsNotDurable) {
    for (const auto plant : {Plant::NoFileSync, Plant::NoDirectorySync, Plant::ManifestFirst}) {
        EXPECT_TRUE(isAnyBroken(plant)) << static_cast<int>(plant);
    }
}

TEST_P(EachOperation, MayBeTheLastBeforePowerIsLost) {
    const auto last = uncut().moments;
    for (std::uint64_t wait = 0; wait <= last; ++wait) {
        for (std::uint64_t seed = 0; seed < survivors; ++seed) {
            expectPeaceAfter(wait, {{Happening::LosePower, 0, seed}});
        }
    }
}

TEST_P(EachOperation, MayBeTheLastOfTheEngine) {
    const auto last = uncut().moments;
    for (std::uint64_t wait = 0; wait <= last; ++wait) {
        expectPeaceAfter(wait, {{Happening::KillEngine, 0, 0}});
        expectPeaceAfter(wait, {{Happening::EndEngine, 0, 0}});
    }
}

TEST_P(EachOperation, MayFail) {
    constexpr std::uint64_t errors = 4; // EIO, ENOSPC, EROFS and ESTALE
    const auto last = uncut().moments;
    for (std::uint64_t wait = 0; wait <= last; ++wait) {
        for (std::uint64_t error = 0; error < errors; ++error) {
            expectPeaceAfter(wait, {{Happening::FailOperations, 0, error}});
        }
    }
}

TEST_P(EachOperation, MayLeaveSomethingThatIsOnlyThoughtToBeDurable) {
    const auto last = uncut().moments;
    for (std::uint64_t wait = 0; wait <= last; ++wait) {
        expectPeaceAfter(wait, {{Happening::FailSync, 0, 0}});
        for (std::uint64_t next = 0; next < 12; next += 2) {
            expectPeaceAfter(wait,
                             {{Happening::FailSync, 0, 0}, {Happening::LosePower, next, next}});
        }
    }
}

} // namespace
