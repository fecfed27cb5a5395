#pragma once

#include <cstdint>
#include <stdexcept>
#include <streambuf>
#include <string_view>

#include "services/wearable/Manifest.h"

namespace quorl::wearable {

/// A text that we have never written. Says what is wrong with it, to be translated.
struct WrongManifest : std::runtime_error {
    using std::runtime_error::runtime_error;
};

/// The only one there has been so far.
inline constexpr std::uint64_t manifestFormat = 1;

/// The manifest that `writeText` made this of. Throws `WrongManifest`, and what reading throws.
[[nodiscard]] Manifest readManifest(std::streambuf& text);
[[nodiscard]] Manifest readManifest(std::string_view text);

} // namespace quorl::wearable
