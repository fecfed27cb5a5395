// The sync engine keeps its promises in many lives, and in each that has ever broken one; and a
// defect that is put into the world around it is found.

#include <fstream>

#include <gtest/gtest.h>

#include "quorl-simulate/World.h"

namespace {

using namespace quorl::simulation;

constexpr std::uint64_t lives = QUORL_LIVES;
constexpr std::size_t events = 120;

std::optional<Life> firstBroken(DiskRules rules, Plant plant, std::uint64_t most) {
    for (std::uint64_t seed = 1; seed <= most; ++seed) {
        auto life = drawLife(seed, rules, events);
        life.plant = plant;
        if (liveOnce(life).breach) {
            return life;
        }
    }
    return std::nullopt;
}

class Lives : public testing::TestWithParam<DiskRules> {};

INSTANTIATE_TEST_SUITE_P(Rules, Lives, testing::Values(DiskRules::Posix, DiskRules::Fat));

TEST_P(Lives, KeepAllPromises) {
    const auto broken = firstBroken(GetParam(), Plant::None, lives);

    EXPECT_FALSE(broken) << toText(broken.value_or(Life())) << "\n"
                         << liveOnce(broken.value_or(Life())).breach.value_or(Breach()).what;
}

TEST_P(Lives, AreTheSameFromTheSameSeed) {
    const auto life = drawLife(7, GetParam(), events);
    std::string first;
    std::string second;
    static_cast<void>(liveOnce(life, [&](const std::string& line) { first += line + "\n"; }));
    static_cast<void>(liveOnce(life, [&](const std::string& line) { second += line + "\n"; }));

    EXPECT_FALSE(first.empty());
    EXPECT_EQ(first, second);
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

class PlantedDefect : public testing::TestWithParam<Plant> {};

INSTANTIATE_TEST_SUITE_P(Plants, PlantedDefect,
                         testing::Values(Plant::NoFileSync, Plant::NoDirectorySync,
                                         Plant::ManifestFirst, Plant::SentBeforeManifest,
                                         Plant::RemovalFirst, Plant::NoOwnership, Plant::NoRetry));

TEST_P(PlantedDefect, IsFound) {
    constexpr std::uint64_t most = 300;

    EXPECT_TRUE(firstBroken(DiskRules::Posix, GetParam(), most));
    EXPECT_TRUE(firstBroken(DiskRules::Fat, GetParam(), most));
}

} // namespace
