#pragma once

#include <string>
#include <string_view>
#include <variant>
#include <vector>

#include "platform/NSInteger.h"

/// What a placeholder of a format can be filled with.
using NSFormatArgument = std::variant<NSUInteger, std::string>;

struct NSString {
    /// `format` with its placeholders filled: `%tu` with a count in the user's digits and grouping,
    /// `%@` with a text, `%%` with a percent sign, `%2$@` and `%2$tu` with the argument of that
    /// number. A placeholder that is unknown or has no argument stays as it is written, an argument
    /// that no placeholder asks for is dropped, and an argument of the other type is shown as what
    /// it is; so no format can read beyond its arguments.
    [[nodiscard]] static std::string
    localizedStringWithFormat(std::string_view format,
                              const std::vector<NSFormatArgument>& arguments);
};
