#pragma once

#include <string>

namespace quorl {

/// A byte count as a text in a language ("de_AT"), in units of 1024: whole bytes and kilobytes, at
/// the most one decimal from megabytes on. What would round to 1,024 of a unit is 1 of the next.
/// Negative counts and NaN read as 0 bytes. Any thread.
[[nodiscard]] std::string sizeText(double bytes, const std::string& language);

} // namespace quorl
