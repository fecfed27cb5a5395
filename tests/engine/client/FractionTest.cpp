#include "services/engine/Fraction.h"

#include <limits>

#include <gtest/gtest.h>

namespace {

using quorl::engine::Fraction;
using Limits = std::numeric_limits<double>;

TEST(AFraction, IsTheNumberBetweenNoneAndAll) {
    EXPECT_EQ(Fraction(), 0.0);
    EXPECT_EQ(Fraction(0.25), 0.25);
    EXPECT_EQ(Fraction(1), 1.0);
}

TEST(AFraction, IsNeverOutsideOfThat) {
    EXPECT_EQ(Fraction(-0.5), 0.0);
    EXPECT_EQ(Fraction(-Limits::infinity()), 0.0);
    EXPECT_EQ(Fraction(1.5), 1.0);
    EXPECT_EQ(Fraction(Limits::max()), 1.0);
    EXPECT_EQ(Fraction(Limits::infinity()), 1.0);
}

TEST(AFraction, OfWhatIsNoNumberIsNone) {
    EXPECT_EQ(Fraction(Limits::quiet_NaN()), 0.0);
    EXPECT_EQ(Fraction(-Limits::quiet_NaN()), 0.0);
}

} // namespace
