#pragma once

#include <string_view>

namespace quorl {

/// The property of a button that makes it one of several choices, with a value: "yes" for the one
/// that is chosen, which has a checkmark, and "no" for the others.
inline constexpr std::string_view RowChosenKey = "chosen";

} // namespace quorl
