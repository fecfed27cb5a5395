#pragma once

#include <cstdint>
#include <stdexcept>
#include <string_view>

#include "services/wearable/Manifest.h"

namespace quorl::wearable {

/// A text that we have never written. Says what is wrong with it, to be translated.
struct WrongManifest : std::runtime_error {
    using std::runtime_error::runtime_error;
};

/// The only one there has been so far.
inline constexpr std::uint64_t manifestFormat = 1;

/// The manifest that `toText` made this of. Throws `WrongManifest`.
[[nodiscard]] Manifest readManifest(std::string_view text);

} // namespace quorl::wearable
