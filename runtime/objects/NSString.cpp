#include "platform/NSString.h"

#include <charconv>
#include <optional>

#include <unicode/numberformatter.h>

#include "runtime/host/Host.h"

namespace {

/// What asks for an argument.
struct Placeholder {
    std::string_view written;          ///< as it stands in the format
    std::optional<std::size_t> number; ///< of the argument, counted from 1; null for the next one
};

/// Takes the number of an argument, "2$", off the front of `text`; null where none is there.
std::optional<std::size_t> takeNumber(std::string_view& text) {
    std::size_t number = 0;
    const char* const end = text.data() + text.size();
    const auto parsed = std::from_chars(text.data(), end, number);
    if (parsed.ec != std::errc() || number == 0 || parsed.ptr == end || *parsed.ptr != '$') {
        return std::nullopt;
    }
    text.remove_prefix(static_cast<std::size_t>(parsed.ptr - text.data()) + 1);
    return number;
}

/// The placeholder at the front of `text`; null where none is there.
std::optional<Placeholder> placeholderAt(std::string_view text) {
    if (!text.starts_with('%')) {
        return std::nullopt;
    }
    std::string_view rest = text.substr(1);
    const auto number = takeNumber(rest);
    for (const std::string_view conversion : {"tu", "@"}) {
        if (rest.starts_with(conversion)) {
            rest.remove_prefix(conversion.size());
            return Placeholder{text.substr(0, text.size() - rest.size()), number};
        }
    }
    return std::nullopt;
}

/// The formatter of the language that was asked for last: to make one takes twenty times as long
/// as to use it.
const icu::number::LocalizedNumberFormatter& countFormatter(const std::string& language) {
    thread_local std::string keptLanguage;
    thread_local std::optional<icu::number::LocalizedNumberFormatter> kept;
    if (!kept || language != keptLanguage) {
        keptLanguage = language;
        kept = icu::number::NumberFormatter::withLocale(
            icu::Locale::createCanonical(language.c_str()));
    }
    return *kept;
}

std::string countText(NSUInteger count) {
    UErrorCode status = U_ZERO_ERROR;
    const auto text = countFormatter(quorl::Host::required().languages().front())
                          .formatDecimal(std::to_string(count), status)
                          .toString(status);
    std::string result;
    return text.toUTF8String(result);
}

std::string argumentText(const NSFormatArgument& argument) {
    const auto* count = std::get_if<NSUInteger>(&argument);
    return count ? countText(*count) : std::get<std::string>(argument);
}

/// The arguments of a format, handed out one after the other or by number.
class ArgumentList {
  public:
    explicit ArgumentList(const std::vector<NSFormatArgument>& arguments) : arguments_(arguments) {}

    /// What stands in a placeholder's place: itself where there is no argument for it.
    std::string textFor(const Placeholder& placeholder) {
        const std::size_t index = placeholder.number ? *placeholder.number - 1 : next_++;
        return index < arguments_.size() ? argumentText(arguments_[index])
                                         : std::string(placeholder.written);
    }

  private:
    const std::vector<NSFormatArgument>& arguments_;
    std::size_t next_ = 0;
};

} // namespace

std::string NSString::localizedStringWithFormat(std::string_view format,
                                                const std::vector<NSFormatArgument>& arguments) {
    ArgumentList list(arguments);
    std::string result;
    while (!format.empty()) {
        if (format.starts_with("%%")) {
            result += '%';
            format.remove_prefix(2);
        } else if (const auto placeholder = placeholderAt(format)) {
            result += list.textFor(*placeholder);
            format.remove_prefix(placeholder->written.size());
        } else {
            result += format.front();
            format.remove_prefix(1);
        }
    }
    return result;
}
