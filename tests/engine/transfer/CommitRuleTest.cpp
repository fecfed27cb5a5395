// When copies are brought onto the device.

#include "quorl-syncd/transfer/pace/CommitRule.h"

#include <gtest/gtest.h>

namespace {

using namespace quorl::syncd;
using namespace std::chrono_literals;

constexpr std::uint64_t megabyte = 1 << 20;
const CommitRule::TimePoint begin(1h);

/// After groups that took this long each.
CommitRule ruleAfter(int groups, Clock::TimePoint::duration each) {
    CommitRule rule(begin);
    for (int group = 0; group < groups; ++group) {
        rule.groupWasCommitted(begin - each, begin);
    }
    return rule;
}

bool isDueAfter(CommitRule rule, std::uint64_t bytes) {
    rule.songWasCopied(bytes);
    return rule.isDue(begin);
}

TEST(Commit, IsDueAfterASecondHoweverLittleThereIs) {
    const CommitRule rule(begin);
    EXPECT_FALSE(rule.isDue(begin + 999ms));
    EXPECT_TRUE(rule.isDue(begin + 1s));
}

TEST(Commit, IsDueAfterSoManySongs) {
    CommitRule rule(begin);
    for (int song = 1; song < 500; ++song) {
        rule.songWasCopied(1);
        EXPECT_FALSE(rule.isDue(begin)) << song;
    }
    rule.songWasCopied(1);
    EXPECT_TRUE(rule.isDue(begin));

    rule.groupWasCommitted(begin, begin);

    EXPECT_FALSE(rule.isDue(begin));
}

TEST(Commit, IsDueAfterSoManyBytes) {
    EXPECT_FALSE(isDueAfter(CommitRule(begin), 64 * megabyte - 1));
    EXPECT_TRUE(isDueAfter(CommitRule(begin), 64 * megabyte));
}

TEST(Commit, TakesMoreAtATimeWhereTheDeviceIsQuickButNotAnyAmount) {
    EXPECT_FALSE(isDueAfter(ruleAfter(1, 249ms), 128 * megabyte - 1));
    EXPECT_TRUE(isDueAfter(ruleAfter(1, 249ms), 128 * megabyte));
    EXPECT_TRUE(isDueAfter(ruleAfter(9, 1ms), 512 * megabyte));
}

TEST(Commit, TakesLessAtATimeWhereTheDeviceIsSlowButNotTooLittle) {
    EXPECT_TRUE(isDueAfter(ruleAfter(1, 250ms), 32 * megabyte));
    EXPECT_FALSE(isDueAfter(ruleAfter(9, 1h), 16 * megabyte - 1));
    EXPECT_TRUE(isDueAfter(ruleAfter(9, 1h), 16 * megabyte));
}

} // namespace
