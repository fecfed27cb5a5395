#pragma once

#include <optional>
#include <string_view>

#include "services/media/playlists/PlaylistContent.h"

namespace quorl::media {

/// Reads the bytes of a playlist in XML (XSPF), in any encoding that they declare or show. An
/// `xml:base` on the way to a location is applied to it; a location that none concerns stays as it
/// is written. Null: the bytes are no such playlist, or in an encoding that is not known.
[[nodiscard]] std::optional<PlaylistContent> parseXmlPlaylist(std::string_view bytes);

} // namespace quorl::media
