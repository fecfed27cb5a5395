#pragma once

#include <string>
#include <string_view>

namespace quorl::media {

/// The address that `reference` means where `base` is the address to start from, as RFC 3986 (5.2)
/// has it. Either may be relative, and so is the result where both are. Queries and fragments are
/// not looked for in `reference`: who writes a song's name with a `#` in it means just that.
[[nodiscard]] std::string resolved(std::string_view base, std::string_view reference);

} // namespace quorl::media
