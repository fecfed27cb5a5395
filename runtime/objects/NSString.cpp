#include "platform/NSString.h"

#include <charconv>
#include <string>

#include <unicode/numberformatter.h>

#include "runtime/host/Host.h"

namespace {

/// A placeholder at the start of `text`: how long it is, and which argument it asks for. `argument`
/// is null for `%%`, 0 for the next argument, else its number counted from 1.
struct Placeholder {
    std::size_t length;
    std::optional<std::size_t> argument;
};

std::optional<Placeholder> placeholderAt(std::string_view text) {
    if (text.starts_with("%%")) {
        return Placeholder{2, std::nullopt};
    }
    std::size_t number = 0;
    std::string_view rest = text.substr(1);
    const auto [end, error] = std::from_chars(rest.data(), rest.data() + rest.size(), number);
    if (error == std::errc() && number > 0 && end != rest.data() + rest.size() && *end == '$') {
        rest.remove_prefix(static_cast<std::size_t>(end - rest.data()) + 1);
    } else {
        number = 0;
    }
    for (const std::string_view conversion : {"tu", "@"}) {
        if (rest.starts_with(conversion)) {
            return Placeholder{text.size() - rest.size() + conversion.size(), number};
        }
    }
    return std::nullopt;
}

std::string countText(NSUInteger count) {
    UErrorCode status = U_ZERO_ERROR;
    const std::string language = quorl::Host::required().languages().front();
    const auto text =
        icu::number::NumberFormatter::withLocale(icu::Locale::createCanonical(language.c_str()))
            .formatDecimal(std::to_string(count), status)
            .toString(status);
    std::string result;
    return text.toUTF8String(result);
}

std::string argumentText(const NSFormatArgument& argument) {
    const auto* count = std::get_if<NSUInteger>(&argument);
    return count ? countText(*count) : std::get<std::string>(argument);
}

} // namespace

std::string NSString::localizedStringWithFormat(std::string_view format,
                                                const std::vector<NSFormatArgument>& arguments) {
    std::string result;
    std::size_t next = 0;
    while (!format.empty()) {
        const std::size_t plain = std::min(format.find('%'), format.size());
        result += format.substr(0, plain);
        format.remove_prefix(plain);
        if (format.empty()) {
            break;
        }
        const auto placeholder = placeholderAt(format);
        const std::size_t length = placeholder ? placeholder->length : 1;
        if (placeholder && !placeholder->argument) {
            result += '%';
        } else {
            const auto wanted = placeholder ? placeholder->argument : std::nullopt;
            const std::size_t index = !wanted ? arguments.size() : *wanted ? *wanted - 1 : next++;
            result += index < arguments.size() ? argumentText(arguments[index])
                                               : std::string(format.substr(0, length));
        }
        format.remove_prefix(length);
    }
    return result;
}
