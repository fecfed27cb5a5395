#pragma once

#include <string>
#include <string_view>
#include <variant>
#include <vector>

#include "services/media/playlists/LeftOut.h"
#include "services/media/playlists/PlaylistContent.h"

namespace quorl::media {

/// The paths that an entry of a playlist may mean, likeliest first, at least one.
using EntryReadings = std::vector<std::string>;

/// Reads `entry`, the UTF-8 text of an entry in a playlist of `format`, without looking at any
/// file.
///
/// Programs disagree about what an entry is: a path with this system's separators or with
/// backslashes, plain or percent-encoded, or a `file:` address. Which one was meant shows only
/// where a file is found, hence several readings. Relative ones are relative to the playlist's
/// directory. The reason instead: no reading can be a file of this machine.
[[nodiscard]] std::variant<EntryReadings, Reason> readEntry(std::string_view entry, Format format);

} // namespace quorl::media
