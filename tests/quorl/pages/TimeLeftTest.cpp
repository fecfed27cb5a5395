#include "quorl/pages/TimeLeft.h"

#include <gtest/gtest.h>

namespace quorl::tests {

namespace {

engine::SessionState halfOf(std::uint64_t bytes, std::uint64_t rate) {
    engine::SessionState session;
    session.isProgressValid = true;
    session.progress = engine::Fraction(0.5);
    session.bytes = bytes;
    session.rate = rate;
    return session;
}

TEST(TimeLeft, isRoughlyTold) {
    EXPECT_EQ(timeLeft(halfOf(100, 1)), "Less than a minute");
    EXPECT_EQ(timeLeft(halfOf(120, 1)), "About 1 minute");
    EXPECT_EQ(timeLeft(halfOf(2 * 150, 1)), "About 3 minutes");
    EXPECT_EQ(timeLeft(halfOf(2 * 5000, 1)), "About 83 minutes");
    EXPECT_EQ(timeLeft(halfOf(2 * 7200, 1)), "About 2 hours");
}

TEST(TimeLeft, isNotToldWhereItIsNotKnown) {
    EXPECT_EQ(timeLeft(halfOf(100, 0)), "");
    EXPECT_EQ(timeLeft(halfOf(std::uint64_t{1} << 63U, 1)), "");
    auto session = halfOf(100, 1);
    session.isProgressValid = false;
    EXPECT_EQ(timeLeft(session), "");
    session.isProgressValid = session.isFinished = true;
    EXPECT_EQ(timeLeft(session), "");
}

} // namespace

} // namespace quorl::tests
