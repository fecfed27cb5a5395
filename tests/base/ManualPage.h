#pragma once

#include <string>

namespace quorl::tests {

/// The first example of a manual page of this tree, as in "quorl-manifest.5". Throws where it has
/// none.
[[nodiscard]] std::string exampleIn(const std::string& page);

} // namespace quorl::tests
