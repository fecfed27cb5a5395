#pragma once

#include <cstddef>
#include <cstdint>
#include <optional>
#include <string>
#include <string_view>

#include "services/media/playlists/Generated.h"
#include "services/media/playlists/TextList.h"

namespace quorl::media {

/// The playlist formats that are understood.
enum class Format : std::uint8_t {
    M3u, ///< `.m3u`, `.m3u8`: one entry a line, `#` begins a comment or a directive.
    Pls, ///< `.pls`: `FileN=` lines, taken in the order of their numbers.
    Xspf ///< `.xspf`: XML, one `<location>` a track.
};

/// Larger playlist files are not read.
inline constexpr std::size_t maximumPlaylistBytes = std::size_t{64} << 20;

/// Further entries of a playlist are not read.
inline constexpr std::uint32_t maximumEntries = 1'000'000;

/// What a playlist file says.
struct PlaylistContent {
    /// In UTF-8. Empty where the file gives no name.
    std::string name;
    Generated generated = Generated::No;
    /// The entries as they are written, in UTF-8, in order. An empty one is a track without
    /// address.
    TextList entries;
    /// There were more than `maximumEntries`, or more text than a playlist file can hold.
    bool truncated = false;

    /// Appends an entry, which need not be valid UTF-8, as far as there is room.
    void add(std::string_view entry);
};

/// The format that a file of this name has by its extension, in any case; null: not a playlist.
[[nodiscard]] std::optional<Format> playlistFormat(std::string_view fileName);

/// What the text of a marker means: `Generated::Playlist` unless it is known.
[[nodiscard]] Generated generatedValue(std::string_view value);

/// Reads the bytes of a playlist file. Any bytes are safe. They are UTF-8, UTF-16 or UTF-32, with
/// byte-order mark or plainly so; XML may declare another encoding. What claims to be UTF-8 is
/// taken as Latin-1 text by text where it is not valid.
///
/// Null: the bytes are not a playlist of this format, so that nobody takes them for an empty one.
[[nodiscard]] std::optional<PlaylistContent> parsePlaylist(Format format, std::string_view bytes);

} // namespace quorl::media
