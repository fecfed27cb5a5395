#include "runtime/services/SizeText.h"

#include <array>
#include <cmath>
#include <optional>

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

using icu::number::LocalizedNumberFormatter;

/// The formatters of the language that was asked for last: to make one takes twenty times as
/// long as to use it.
class Formatters {
  public:
    /// `unit` is a place in `units`.
    const LocalizedNumberFormatter& of(std::size_t unit, const std::string& language) {
        if (language != language_) {
            language_ = language;
            kept_.fill(std::nullopt);
        }
        auto& kept = kept_.at(unit);
        if (!kept) {
            kept = made(units.at(unit), language);
        }
        return *kept;
    }

  private:
    static LocalizedNumberFormatter made(const Unit& unit, const std::string& language) {
        return icu::number::NumberFormatter::withLocale(
                   icu::Locale::createCanonical(language.c_str()))
            .unit(unit.unit())
            .unitWidth(unit.width)
            .precision(icu::number::Precision::maxFraction(unit.decimals));
    }

    std::string language_;
    std::array<std::optional<LocalizedNumberFormatter>, units.size()> kept_;
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
    thread_local Formatters formatters;
    UErrorCode status = U_ZERO_ERROR;
    const auto text = formatters.of(unit, language).formatDouble(amount, status).toString(status);
    std::string result;
    return text.toUTF8String(result);
}

} // namespace quorl
