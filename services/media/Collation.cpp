#include "services/media/Collation.h"

#include <cstdint>

#include <glib.h>
#include <unicode/locid.h>
#include <unicode/stringpiece.h>

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

int Collation::compare(std::string_view left, std::string_view right) const {
    UErrorCode error = U_ZERO_ERROR;
    return collator_ ? collator_->compareUTF8(piece(left), piece(right), error)
                     : left.compare(right);
}

} // namespace quorl::media
