#include <cmath>
#include <limits>

#include <gtest/gtest.h>
#include <unicode/measunit.h>
#include <unicode/numberformatter.h>

#include "platform/SizeFormatter.h"
#include "tests/support/TestHost.h"

namespace {

using icu::MeasureUnit;
using quorl::tests::TestHost;

/// What ICU gives for an amount of a unit in a language: the space before the unit, digits and the
/// unit's name are its business.
std::string amountOf(double amount, const MeasureUnit& unit, const std::string& language = "en") {
    const bool isBytes = std::string_view(unit.getSubtype()) == "byte";
    UErrorCode status = U_ZERO_ERROR;
    std::string text;
    icu::number::NumberFormatter::withLocale(icu::Locale::createCanonical(language.c_str()))
        .unit(unit)
        .unitWidth(isBytes ? UNUM_UNIT_WIDTH_FULL_NAME : UNUM_UNIT_WIDTH_SHORT)
        .precision(icu::number::Precision::maxFraction(1))
        .formatDouble(amount, status)
        .toString(status)
        .toUTF8String(text);
    return text;
}

const MeasureUnit bytes = MeasureUnit::getByte();
const MeasureUnit kilobytes = MeasureUnit::getKilobyte();
const MeasureUnit megabytes = MeasureUnit::getMegabyte();
const MeasureUnit gigabytes = MeasureUnit::getGigabyte();
const MeasureUnit terabytes = MeasureUnit::getTerabyte();
const MeasureUnit petabytes = MeasureUnit::getPetabyte();

constexpr float kilo = 1024.0F;
constexpr float mega = 1024.0F * kilo;
constexpr float giga = 1024.0F * mega;

class SizeTexts : public testing::Test {
  protected:
    std::shared_ptr<TestHost> host_ = TestHost::installed();
};

TEST_F(SizeTexts, NameBytesInFull) {
    EXPECT_EQ(CPFSSizeStrings(0.0F), amountOf(0, bytes));
    EXPECT_EQ(CPFSSizeStrings(1.0F), amountOf(1, bytes));
    EXPECT_EQ(CPFSSizeStrings(1023.0F), amountOf(1023, bytes));
    EXPECT_NE(CPFSSizeStrings(1.0F).find("byte"), std::string::npos);
    EXPECT_NE(CPFSSizeStrings(1023.0F).find("1,023"), std::string::npos);
}

TEST_F(SizeTexts, NameTheStoragePresets) {
    EXPECT_EQ(CPFSSizeStrings(100 * mega), amountOf(100, megabytes));
    EXPECT_EQ(CPFSSizeStrings(500 * mega), amountOf(500, megabytes));
    EXPECT_EQ(CPFSSizeStrings(1 * giga), amountOf(1, gigabytes));
    EXPECT_EQ(CPFSSizeStrings(2 * giga), amountOf(2, gigabytes));
}

TEST_F(SizeTexts, HaveOneDecimalFromMegabytesOn) {
    EXPECT_EQ(CPFSSizeStrings(1.5F * kilo), amountOf(2, kilobytes));
    EXPECT_EQ(CPFSSizeStrings(1.25F * kilo), amountOf(1, kilobytes));
    EXPECT_EQ(CPFSSizeStrings(2.3F * mega), amountOf(2.3, megabytes));
    EXPECT_EQ(CPFSSizeStrings(1'500'000'000.0F), amountOf(1.4, gigabytes));
    EXPECT_EQ(CPFSSizeStrings(3 * 1024 * giga), amountOf(3, terabytes));
    EXPECT_EQ(CPFSSizeStrings(1.5F * 1024 * giga), amountOf(1.5, terabytes));
    EXPECT_EQ(CPFSSizeStrings(1.5F * 1024 * 1024 * giga), amountOf(1.5, petabytes));
}

TEST_F(SizeTexts, HaveNoPartOfAByte) { EXPECT_EQ(CPFSSizeStrings(1.3F), amountOf(1, bytes)); }

TEST_F(SizeTexts, NeverSay1024OfAUnit) {
    EXPECT_EQ(CPFSSizeStrings(1024.0F), amountOf(1, kilobytes));
    EXPECT_EQ(CPFSSizeStrings(1023.4F * kilo), amountOf(1023, kilobytes));
    EXPECT_EQ(CPFSSizeStrings(1023.6F * kilo), amountOf(1, megabytes));
    EXPECT_EQ(CPFSSizeStrings(1023.9F * mega), amountOf(1023.9, megabytes));
    EXPECT_EQ(CPFSSizeStrings(1023.952F * mega), amountOf(1, gigabytes));
    EXPECT_EQ(CPFSSizeStrings(1023.96F * mega), amountOf(1, gigabytes));
    EXPECT_EQ(CPFSSizeStrings(1024 * giga), amountOf(1, terabytes));
}

TEST_F(SizeTexts, TakeWhatIsNoSizeForNothing) {
    EXPECT_EQ(CPFSSizeStrings(-1.0F), amountOf(0, bytes));
    EXPECT_EQ(CPFSSizeStrings(-0.0F), amountOf(0, bytes));
    EXPECT_EQ(CPFSSizeStrings(-std::numeric_limits<float>::infinity()), amountOf(0, bytes));
    EXPECT_EQ(CPFSSizeStrings(std::numeric_limits<float>::quiet_NaN()), amountOf(0, bytes));
}

TEST_F(SizeTexts, SayTheLargestSizesToo) {
    const std::string all64Bits =
        CPFSSizeStrings(static_cast<float>(std::numeric_limits<std::uint64_t>::max()));

    EXPECT_EQ(all64Bits, amountOf(16384, petabytes));
    EXPECT_FALSE(CPFSSizeStrings(std::numeric_limits<float>::infinity()).empty());
}

class SizeTextsByLanguage : public testing::TestWithParam<std::string> {};

TEST_P(SizeTextsByLanguage, AreWhatTheLanguageWrites) {
    const auto host = TestHost::installed();
    host->setLanguages({GetParam(), "en"});

    EXPECT_EQ(CPFSSizeStrings(0.0F), amountOf(0, bytes, GetParam()));
    EXPECT_EQ(CPFSSizeStrings(1.0F), amountOf(1, bytes, GetParam()));
    EXPECT_EQ(CPFSSizeStrings(2.0F), amountOf(2, bytes, GetParam()));
    EXPECT_EQ(CPFSSizeStrings(100 * mega), amountOf(100, megabytes, GetParam()));
    EXPECT_EQ(CPFSSizeStrings(1'500'000'000.0F), amountOf(1.4, gigabytes, GetParam()));
}

INSTANTIATE_TEST_SUITE_P(Languages, SizeTextsByLanguage,
                         testing::Values("en", "de", "de_AT", "fr", "ar", "ar_EG", "es", "it", "ja",
                                         "nl", "pl", "pt_BR", "ru", "sv", "zh_CN"));

TEST_F(SizeTexts, UseTheLanguagesOwnDigitsAndSeparators) {
    host_->setLanguages({"de"});
    EXPECT_NE(CPFSSizeStrings(1'500'000'000.0F).find("1,4"), std::string::npos);
    host_->setLanguages({"fr"});
    EXPECT_NE(CPFSSizeStrings(100 * mega).find("Mo"), std::string::npos);
    host_->setLanguages({"ar_EG"});
    EXPECT_NE(CPFSSizeStrings(100 * mega).find("١٠٠"), std::string::npos);
}

} // namespace
