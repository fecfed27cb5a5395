#include "runtime/services/SizeText.h"

#include <array>
#include <cmath>

#include <unicode/measunit.h>
#include <unicode/numberformatter.h>

namespace quorl {

namespace {

struct Unit {
    icu::MeasureUnit (*unit)();
    UNumberUnitWidth width;
    int decimals;
};

constexpr std::array units{
    Unit{icu::MeasureUnit::getByte, UNUM_UNIT_WIDTH_FULL_NAME, 0},
    Unit{icu::MeasureUnit::getKilobyte, UNUM_UNIT_WIDTH_SHORT, 0},
    Unit{icu::MeasureUnit::getMegabyte, UNUM_UNIT_WIDTH_SHORT, 1},
    Unit{icu::MeasureUnit::getGigabyte, UNUM_UNIT_WIDTH_SHORT, 1},
    Unit{icu::MeasureUnit::getTerabyte, UNUM_UNIT_WIDTH_SHORT, 1},
    Unit{icu::MeasureUnit::getPetabyte, UNUM_UNIT_WIDTH_SHORT, 1},
};

double rounded(double amount, int decimals) {
    const double power = std::pow(10.0, decimals);
    return std::nearbyint(amount * power) / power;
}

} // namespace

std::string sizeText(double bytes, const std::string& language) {
    double amount = bytes > 0 ? bytes : 0;
    std::size_t unit = 0;
    while (unit + 1 < units.size() && rounded(amount, units[unit].decimals) >= 1024) {
        amount /= 1024;
        ++unit;
    }
    UErrorCode status = U_ZERO_ERROR;
    const auto text =
        icu::number::NumberFormatter::withLocale(icu::Locale::createCanonical(language.c_str()))
            .unit(units[unit].unit())
            .unitWidth(units[unit].width)
            .precision(icu::number::Precision::maxFraction(units[unit].decimals))
            .formatDouble(amount, status)
            .toString(status);
    std::string result;
    return text.toUTF8String(result);
}

} // namespace quorl
