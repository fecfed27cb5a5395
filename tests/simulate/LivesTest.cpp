// The sync engine keeps its promises in many lives, and in each that has ever broken one; and a
// defect that is put into the world around it is found.

#include <fstream>

#include <gtest/gtest.h>

#include "quorl-simulate/World.h"

namespace {

using namespace quorl::simulation;

constexpr std::size_t events = 120;
constexpr std::uint64_t livesInAll = 2'000;
/// Parts run side by side.
constexpr std::uint64_t parts = 8;

/// Of `count` lives from this seed on.
std::optional<Life> firstBroken(DiskRules rules, Plant plant, std::uint64_t seed,
                                std::uint64_t count) {
    for (const auto end = seed + count; seed < end; ++seed) {
        auto life = drawLife(seed, rules, events);
        life.plant = plant;
        if (liveOnce(life).breach) {
            return life;
        }
    }
    return std::nullopt;
}

class Lives : public testing::TestWithParam<std::tuple<DiskRules, std::uint64_t>> {};

INSTANTIATE_TEST_SUITE_P(Parts, Lives,
                         testing::Combine(testing::Values(DiskRules::Posix, DiskRules::Fat),
                                          testing::Range<std::uint64_t>(0, parts)));

TEST_P(Lives, KeepAllPromises) {
    constexpr auto count = livesInAll / parts;
    const auto [rules, part] = GetParam();
    const auto broken = firstBroken(rules, Plant::None, 1 + part * count, count);

    EXPECT_FALSE(broken) << toText(broken.value_or(Life())) << "\n"
                         << liveOnce(broken.value_or(Life())).breach.value_or(Breach()).what;
}

TEST(Life, IsTheSameFromTheSameSeed) {
    for (const auto rules : {DiskRules::Posix, DiskRules::Fat}) {
        const auto life = drawLife(7, rules, events);
        std::string first;
        std::string second;
        static_cast<void>(liveOnce(life, [&](const std::string& line) { first += line + "\n"; }));
        static_cast<void>(liveOnce(life, [&](const std::string& line) { second += line + "\n"; }));

        EXPECT_FALSE(first.empty());
        EXPECT_EQ(first, second);
    }
}

TEST(LifeText, CanBeReadAgain) {
    const auto life = drawLife(3, DiskRules::Fat, events);

    EXPECT_EQ(parseLife(toText(life) + " # a word"), life);
    EXPECT_EQ(parseLife("posix x"), std::nullopt);
    EXPECT_EQ(parseLife("posix 1 nonsense:0:0"), std::nullopt);
}

TEST(Corpus, IsNotBrokenAnyMore) {
    std::ifstream corpus(QUORL_CORPUS);
    ASSERT_TRUE(corpus);
    for (std::string line; std::getline(corpus, line);) {
        const auto life = parseLife(line);
        ASSERT_TRUE(life) << line;
        const auto breach = liveOnce(*life).breach;
        EXPECT_FALSE(breach) << line << "\n" << breach->what;
    }
}

class PlantedDefect : public testing::TestWithParam<std::tuple<Plant, DiskRules>> {};

INSTANTIATE_TEST_SUITE_P(
    Plants, PlantedDefect,
    testing::Combine(testing::Values(Plant::NoFileSync, Plant::NoDirectorySync,
                                     Plant::ManifestFirst, Plant::SentBeforeManifest,
                                     Plant::RemovalFirst, Plant::NoOwnership, Plant::NoRetry),
                     testing::Values(DiskRules::Posix, DiskRules::Fat)));

TEST_P(PlantedDefect, IsFound) {
    constexpr std::uint64_t most = 1'000;
    const auto [plant, rules] = GetParam();

    EXPECT_TRUE(firstBroken(rules, plant, 1, most));
}

} // namespace
