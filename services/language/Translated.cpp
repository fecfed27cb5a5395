#include "services/language/Translated.h"

#include <algorithm>
#include <clocale>
#include <limits>

#include <libintl.h>

#include "services/language/Languages.h"
#include "services/language/Numbers.h"

namespace quorl::language {

namespace {

/// gettext translates nothing in the locale "C", which many a session has; and the locale of a
/// language need not be installed.
class TranslatingLocale {
  public:
    TranslatingLocale() : before_(uselocale(locale())) {}

    TranslatingLocale(const TranslatingLocale&) = delete;
    TranslatingLocale& operator=(const TranslatingLocale&) = delete;

    ~TranslatingLocale() { uselocale(before_); }

  private:
    static locale_t locale() {
        static const locale_t utf8 = newlocale(LC_ALL_MASK, "C.UTF-8", nullptr);
        return utf8;
    }

    const locale_t before_;
};

/// gettext counts in words of the machine. The form of a larger number is, in all languages, that
/// of one with the same last digits.
unsigned long countForGettext(std::uint64_t count) {
    constexpr std::uint64_t digits = 1'000'000;
    return static_cast<unsigned long>(
        count > std::numeric_limits<unsigned long>::max() ? digits + count % digits : count);
}

bool isEnglish() { return followedLanguages().front() == "en"; }

} // namespace

std::string translated(const char* english) {
    if (isEnglish() || *english == '\0') {
        return english; // gettext's text for nothing is what a catalogue says of itself
    }
    const TranslatingLocale translating;
    return gettext(english);
}

std::string translatedCount(const char* one, const char* many, std::uint64_t count) {
    const TranslatingLocale translating;
    const char* const form =
        isEnglish() ? (count == 1 ? one : many) : ngettext(one, many, countForGettext(count));
    return filled(form, {{"count", numberText(count)}});
}

std::string filled(std::string_view pattern, const Fill& fill) {
    std::string text;
    for (;;) {
        const auto open = pattern.find('{');
        const auto close = pattern.find('}', std::min(open, pattern.size()));
        text += pattern.substr(0, close == std::string_view::npos ? pattern.size() : open);
        if (close == std::string_view::npos) {
            return text;
        }
        text += fill(pattern.substr(open + 1, close - open - 1));
        pattern.remove_prefix(close + 1);
    }
}

std::string filled(std::string_view pattern,
                   const std::vector<std::pair<std::string_view, std::string>>& texts) {
    return filled(pattern, [&texts](std::string_view blank) {
        const auto found =
            std::ranges::find(texts, blank, &std::pair<std::string_view, std::string>::first);
        return found == texts.end() ? "{" + std::string(blank) + "}" : found->second;
    });
}

} // namespace quorl::language
