#pragma once

#include <cstdint>
#include <functional>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

namespace quorl::language {

/// Marks an English text that is translated where it is used, for those who collect what there is
/// to translate.
constexpr const char* toTranslate(const char* english) { return english; }

/// The text in the language that is followed; the English one where it is not translated. Any
/// thread.
[[nodiscard]] std::string translated(const char* english);

/// The form of a text that goes with `count`, which stands in it as "{count}". Any thread.
/// @param one the English text for 1.
/// @param many the one for all others.
[[nodiscard]] std::string translatedCount(const char* one, const char* many, std::uint64_t count);

/// What stands in place of a blank; `blank` is what is between its braces.
using Fill = std::function<std::string(std::string_view blank)>;

/// `pattern` with its blanks, "{like this}", filled. What has no second brace stays as it is.
[[nodiscard]] std::string filled(std::string_view pattern, const Fill& fill);

/// The same with a text for each name; a blank of another name stays as it is.
[[nodiscard]] std::string
filled(std::string_view pattern,
       const std::vector<std::pair<std::string_view, std::string>>& texts);

} // namespace quorl::language
