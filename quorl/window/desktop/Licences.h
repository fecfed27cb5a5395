#pragma once

#include <span>

namespace quorl {

/// Under which licence something that the app is made with stands.
struct Licence {
    const char* work;
    const char* identifier; ///< as SPDX has it; of several that may be chosen, the one we take
};

/// The app's own.
inline constexpr auto ownLicence = "Apache-2.0";

/// Of the libraries that the app uses.
[[nodiscard]] std::span<const Licence> licences();

} // namespace quorl
