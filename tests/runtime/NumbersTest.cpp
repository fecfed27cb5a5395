#include <cmath>
#include <limits>

#include <gtest/gtest.h>

#include "platform/Foundation.h"

namespace {

constexpr double infinity = std::numeric_limits<double>::infinity();
constexpr double noNumber = std::numeric_limits<double>::quiet_NaN();
constexpr auto largest64 = std::numeric_limits<std::uint64_t>::max();
constexpr auto largest32 = std::numeric_limits<std::uint32_t>::max();

struct Truncation {
    double value;
    std::uint64_t in64Bits;
    std::uint32_t in32Bits;
};

class SaturatingTruncation : public testing::TestWithParam<Truncation> {};

TEST_P(SaturatingTruncation, KeepsTheValueWithinWhatTheTypeHolds) {
    EXPECT_EQ(NSSaturatingTruncate<std::uint64_t>(GetParam().value), GetParam().in64Bits);
    EXPECT_EQ(NSSaturatingTruncate<std::uint32_t>(GetParam().value), GetParam().in32Bits);
}

INSTANTIATE_TEST_SUITE_P(
    Table, SaturatingTruncation,
    testing::Values(Truncation{0.0, 0, 0}, Truncation{-0.0, 0, 0}, Truncation{0.999, 0, 0},
                    Truncation{1.0, 1, 1}, Truncation{99.9999, 99, 99}, Truncation{-0.5, 0, 0},
                    Truncation{-1e300, 0, 0}, Truncation{-infinity, 0, 0},
                    Truncation{noNumber, 0, 0}, Truncation{4294967295.0, 4294967295U, largest32},
                    Truncation{4294967295.9, 4294967295U, largest32},
                    Truncation{4294967296.0, 4294967296U, largest32},
                    Truncation{9007199254740993.0, 9007199254740992U, largest32},
                    Truncation{18446744073709549568.0, 18446744073709549568U, largest32},
                    Truncation{18446744073709551616.0, largest64, largest32},
                    Truncation{1e300, largest64, largest32},
                    Truncation{infinity, largest64, largest32}));

std::shared_ptr<NSNumber> unsignedNumber(std::uint64_t value) {
    return NSNumber::numberWithUnsignedLongLong(value);
}

std::shared_ptr<NSNumber> signedNumber(std::int64_t value) {
    return NSNumber::numberWithLongLong(value);
}

std::shared_ptr<NSNumber> real(double value) { return NSNumber::numberWithDouble(value); }

TEST(Numbers, AreFoundAmongObjects) {
    const auto number = real(0.5);
    EXPECT_EQ(NSNumber::of(number.get()), number.get());
    EXPECT_EQ(NSNumber::of(create<NSObject>().get()), nullptr);
    EXPECT_EQ(NSNumber::of(nullptr), nullptr);
}

struct Pair {
    std::shared_ptr<NSNumber> left;
    std::shared_ptr<NSNumber> right;
    bool isEqual;
};

class NumberEquality : public testing::TestWithParam<Pair> {};

TEST_P(NumberEquality, IsOfTheMathematicalValueAndWorksBothWays) {
    const Pair& pair = GetParam();

    EXPECT_EQ(pair.left->isEqual(pair.right.get()), pair.isEqual);
    EXPECT_EQ(pair.right->isEqual(pair.left.get()), pair.isEqual);
}

INSTANTIATE_TEST_SUITE_P(
    Table, NumberEquality,
    testing::Values(
        Pair{unsignedNumber(7), signedNumber(7), true}, Pair{unsignedNumber(7), real(7.0), true},
        Pair{signedNumber(-7), real(-7.0), true}, Pair{unsignedNumber(7), real(7.5), false},
        Pair{signedNumber(-7), real(7.0), false}, Pair{signedNumber(7), real(-7.0), false},
        Pair{unsignedNumber(0), real(-0.0), true},
        Pair{unsignedNumber(0), real(18446744073709551616.0), false},
        Pair{signedNumber(0), real(-18446744073709551616.0), false},
        Pair{unsignedNumber(0), real(infinity), false},
        Pair{unsignedNumber(0), real(noNumber), false},
        Pair{unsignedNumber(largest64), signedNumber(-1), false},
        Pair{unsignedNumber(largest64), unsignedNumber(largest64 - 1), false},
        Pair{unsignedNumber(1ULL << 63U), signedNumber(std::numeric_limits<std::int64_t>::min()),
             false},
        Pair{signedNumber(std::numeric_limits<std::int64_t>::min()), real(-9223372036854775808.0),
             true},
        Pair{unsignedNumber(9007199254740993), real(9007199254740992.0), false},
        Pair{unsignedNumber(9007199254740992), real(9007199254740992.0), true},
        Pair{unsignedNumber(largest64), real(18446744073709551616.0), false},
        Pair{unsignedNumber(0), real(noNumber), false}, Pair{real(noNumber), real(noNumber), false},
        Pair{real(infinity), real(infinity), true}, Pair{real(infinity), real(-infinity), false},
        Pair{NSNumber::numberWithBool(true), unsignedNumber(1), true},
        Pair{NSNumber::numberWithBool(false), real(0.0), true},
        Pair{NSNumber::numberWithBool(true), unsignedNumber(2), false}));

TEST(Numbers, AreEqualToNothingThatIsNoNumber) {
    EXPECT_FALSE(unsignedNumber(0)->isEqual(nullptr));
    EXPECT_FALSE(unsignedNumber(0)->isEqual(create<NSObject>().get()));
}

TEST(Numbers, KeepAll64Bits) {
    EXPECT_EQ(unsignedNumber(largest64)->unsignedLongLongValue(), largest64);
    EXPECT_EQ(NSNumber::numberWithUnsignedInteger(1234)->unsignedIntegerValue(), 1234U);
}

TEST(Numbers, KeepTheLowBitsOfAnIntegerUnderAnotherType) {
    EXPECT_EQ(signedNumber(-1)->unsignedLongLongValue(), largest64);
    EXPECT_EQ(signedNumber(-1)->unsignedIntegerValue(), std::numeric_limits<NSUInteger>::max());
    EXPECT_EQ(unsignedNumber((1ULL << 32U) + 5)->unsignedIntegerValue(),
              static_cast<NSUInteger>((1ULL << 32U) + 5));
}

TEST(Numbers, TruncateADoubleAndHoldItInRange) {
    EXPECT_EQ(real(1.9)->unsignedIntegerValue(), 1U);
    EXPECT_EQ(real(-3.0)->unsignedLongLongValue(), 0U);
    EXPECT_EQ(real(1e30)->unsignedLongLongValue(), largest64);
    EXPECT_EQ(real(noNumber)->unsignedLongLongValue(), 0U);
}

TEST(Numbers, GiveTheirDoubleAndTruthValue) {
    EXPECT_EQ(unsignedNumber(1'500'000'000)->doubleValue(), 1.5e9);
    EXPECT_EQ(signedNumber(-2)->doubleValue(), -2.0);
    EXPECT_TRUE(real(0.5)->boolValue());
    EXPECT_FALSE(real(0.0)->boolValue());
    EXPECT_TRUE(signedNumber(-1)->boolValue());
    EXPECT_FALSE(NSNumber::numberWithBool(false)->boolValue());
}

} // namespace
