#include <limits>

#include <gtest/gtest.h>

#include "tests/support/TestHost.h"

namespace {

using quorl::tests::TestHost;

struct Filling {
    std::string format;
    std::vector<NSFormatArgument> arguments;
    std::string text;
};

class Formatting : public testing::TestWithParam<Filling> {
  protected:
    std::shared_ptr<TestHost> host_ = TestHost::installed();
};

TEST_P(Formatting, FillsWhatItKnowsAndKeepsTheRest) {
    EXPECT_EQ(NSString::localizedStringWithFormat(GetParam().format, GetParam().arguments),
              GetParam().text);
}

constexpr NSUInteger three = 3;
constexpr NSUInteger four = 4;

INSTANTIATE_TEST_SUITE_P(
    Placeholders, Formatting,
    testing::Values(Filling{"", {}, ""}, Filling{"plain", {}, "plain"},
                    Filling{"%tu Songs", {three}, "3 Songs"},
                    Filling{"up %@.", {std::string("1 GB")}, "up 1 GB."},
                    Filling{"%tu%% of %@", {three, std::string("it")}, "3% of it"},
                    Filling{"%tu and %tu", {three, four}, "3 and 4"},
                    Filling{"%2$tu before %1$tu", {three, four}, "4 before 3"},
                    Filling{"%2$@: %1$tu", {three, std::string("songs")}, "songs: 3"},
                    Filling{"%1$tu, again %1$tu", {three}, "3, again 3"}, Filling{"%%", {}, "%"},
                    Filling{"%%%tu", {three}, "%3"}, Filling{"%%tu", {three}, "%tu"},
                    Filling{"50 %% … ü", {}, "50 % … ü"}));

INSTANTIATE_TEST_SUITE_P(
    HostileFormats, Formatting,
    testing::Values(Filling{"%tu", {}, "%tu"}, Filling{"%tu %tu", {three}, "3 %tu"},
                    Filling{"%@", {}, "%@"}, Filling{"%s %n %d %x", {three, four}, "%s %n %d %x"},
                    Filling{"%", {three}, "%"}, Filling{"100 %", {three}, "100 %"},
                    Filling{"%t", {three}, "%t"}, Filling{"% tu", {three}, "% tu"},
                    Filling{"%1", {three}, "%1"}, Filling{"%1$", {three}, "%1$"},
                    Filling{"%0$tu", {three}, "%0$tu"}, Filling{"%2$tu", {three}, "%2$tu"},
                    Filling{"%-1$tu", {three}, "%-1$tu"},
                    Filling{"%99999999999999999999$tu", {three}, "%99999999999999999999$tu"},
                    Filling{"%18446744073709551615$tu", {three}, "%18446744073709551615$tu"},
                    Filling{"%tu", {std::string("text")}, "text"}, Filling{"%@", {three}, "3"},
                    Filling{"only %tu", {three, std::string("dropped")}, "only 3"},
                    Filling{"%@", {std::string("%tu %@ %%")}, "%tu %@ %%"}));

class CountText : public testing::Test {
  protected:
    std::string count(const std::string& language, NSUInteger value) {
        host_->setLanguages({language});
        return NSString::localizedStringWithFormat("%tu", {value});
    }

    std::shared_ptr<TestHost> host_ = TestHost::installed();
};

TEST_F(CountText, IsGroupedAsTheUsersLanguageDoesIt) {
    EXPECT_EQ(count("en", 1234567), "1,234,567");
    EXPECT_EQ(count("de", 1234567), "1.234.567");
    EXPECT_EQ(count("de_CH", 1234567), "1’234’567");
    EXPECT_EQ(count("fr", 1234567), "1\u202f234\u202f567");
}

TEST_F(CountText, IsWrittenInTheUsersDigits) {
    EXPECT_EQ(count("ar_EG", 250), "٢٥٠");
    EXPECT_EQ(count("fa", 15), "۱۵");
}

TEST_F(CountText, IsShownToTheLargestCount) {
    EXPECT_EQ(count("en", std::numeric_limits<std::uint32_t>::max()), "4,294,967,295");
    if constexpr (sizeof(NSUInteger) == 8) {
        EXPECT_EQ(count("en", std::numeric_limits<NSUInteger>::max()),
                  "18,446,744,073,709,551,615");
    }
}

TEST_F(CountText, OfAnUnknownLanguageIsStillANumber) {
    EXPECT_EQ(count("tlh", 15), "15");
    EXPECT_EQ(count("not a language", 15), "15");
}

} // namespace
