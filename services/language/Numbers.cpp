#include "services/language/Numbers.h"

#include <unicode/measunit.h>
#include <unicode/numberformatter.h>

#include "services/language/Languages.h"

namespace quorl::language {

namespace {

icu::number::LocalizedNumberFormatter formatter() {
    return icu::number::NumberFormatter::withLocale(
        icu::Locale::createCanonical(followedLanguages().front().c_str()));
}

/// To make one takes many times as long as to use it.
const icu::number::LocalizedNumberFormatter& formatterOfCounts() {
    thread_local std::string language;
    thread_local icu::number::LocalizedNumberFormatter kept;
    if (language != followedLanguages().front()) {
        language = followedLanguages().front();
        kept = formatter();
    }
    return kept;
}

std::string textOf(const icu::number::FormattedNumber& number) {
    UErrorCode status = U_ZERO_ERROR;
    std::string text;
    return number.toString(status).toUTF8String(text);
}

} // namespace

std::string numberText(std::uint64_t number) {
    UErrorCode status = U_ZERO_ERROR;
    return textOf(formatterOfCounts().formatDecimal(std::to_string(number), status));
}

std::string percentText(double share) {
    UErrorCode status = U_ZERO_ERROR;
    return textOf(formatter()
                      .unit(icu::NoUnit::percent())
                      .scale(icu::number::Scale::powerOfTen(2))
                      .precision(icu::number::Precision::integer())
                      .roundingMode(UNUM_ROUND_DOWN)
                      .formatDouble(share, status));
}

std::string megabyteText(std::uint64_t megabytes) {
    UErrorCode status = U_ZERO_ERROR;
    return textOf(formatter()
                      .unit(icu::MeasureUnit::getMegabyte())
                      .unitWidth(UNUM_UNIT_WIDTH_SHORT)
                      .formatDecimal(std::to_string(megabytes), status));
}

} // namespace quorl::language
