#pragma once

#include <cstdint>

namespace quorl::media {

/// Whether a program made the playlist. It says so in a marker:
///  * m3u and pls: a comment line `#GENERATED`, `#GENERATED:playlist` or `#GENERATED:mix`, in pls
///    also with `;` in place of `#`;
///  * xspf: `<meta rel="urn:quorl:generated">mix</meta>`, or with `playlist`, in the `<playlist>`.
/// A marker with no value, or with one that is not known, counts as `playlist`.
enum class Generated : std::uint8_t { No, Mix, Playlist };

} // namespace quorl::media
