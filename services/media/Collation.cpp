#include "services/media/Collation.h"

#include <bit>
#include <cstdint>

#include <glib.h>
#include <unicode/locid.h>
#include <unicode/stringpiece.h>
#include <unicode/unistr.h>

namespace quorl::media {

namespace {

icu::Locale userLocale() {
    for (const char* const variable : {"LC_ALL", "LC_COLLATE", "LANG"}) {
        const char* const value = g_getenv(variable);
        if (value == nullptr || *value == '\0') {
            continue;
        }
        const std::string_view language =
            std::string_view(value).substr(0, std::string_view(value).find('.'));
        return language == "C" || language == "POSIX" ? icu::Locale::getRoot() : icu::Locale(value);
    }
    return icu::Locale::getRoot();
}

icu::StringPiece piece(std::string_view text) {
    return {text.data(), static_cast<std::int32_t>(text.size())};
}

} // namespace

Collation::Collation() {
    UErrorCode error = U_ZERO_ERROR;
    collator_.reset(icu::Collator::createInstance(userLocale(), error));
}

std::string Collation::key(std::string_view text) const {
    if (!collator_) {
        return std::string(text);
    }
    const auto unicode = icu::UnicodeString::fromUTF8(piece(text));
    std::string result(text.size() * 2 + 8, '\0');
    const auto fill = [&] {
        return static_cast<std::size_t>(
            collator_->getSortKey(unicode, std::bit_cast<std::uint8_t*>(result.data()),
                                  static_cast<std::int32_t>(result.size())));
    };
    const std::size_t size = fill();
    const bool fits = size <= result.size();
    result.resize(size);
    if (!fits) {
        fill();
    }
    return result;
}

} // namespace quorl::media
