#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>

namespace quorl::media {

/// Why something that a music folder names or holds is in no playlist of its inventory.
enum class Reason : std::uint8_t {
    NoAddress,           ///< An entry that names no file at all, such as a track with a title only.
    RemoteAddress,       ///< `http://…` and the like, and a `file:` address of another machine.
    OtherSystem,         ///< `C:\…`, `\\server\…`: an absolute path that means nothing here.
    OutsideFolder,       ///< Absolute, by `..` or by a symbolic link: it leads out of the folder.
    Missing,             ///< Nothing is there, or a symbolic link that leads nowhere.
    Unreachable,         ///< A directory on the way to it may not be entered.
    Hidden,              ///< Its name, or that of a directory on the way, begins with a dot.
    NotRegularFile,      ///< A directory, a pipe, a socket, a device.
    NotMusic,            ///< Neither audio nor video by its content type; playlists are not either.
    PlaylistUnreadable,  ///< The playlist file could not be opened or read.
    PlaylistTooLarge,    ///< The playlist file has more than `maximumPlaylistBytes`.
    PlaylistBroken,      ///< The playlist file is not well-formed, of its format, or in a known
                         ///< encoding.
    TooManyEntries,      ///< The playlist lists more than `maximumEntries`; the rest is left out.
    SameAsAnother,       ///< Another playlist has the same path in another Unicode normalisation.
    DirectoryUnreadable, ///< A directory could not be opened or read; nothing below it is known.
};

/// What to tell a person about `reason`: one or two English sentences that say what is the matter
/// and, where something can be done about it, what.
[[nodiscard]] const char* sentence(Reason reason);

/// The word for programs, in small letters and dashes.
[[nodiscard]] std::string_view code(Reason reason);

/// Nothing for a word that stands for none.
[[nodiscard]] std::optional<Reason> reasonOf(std::string_view code);

/// One thing that was left out.
struct LeftOut {
    /// The playlist file, or the directory that cannot be read: its path relative to the music
    /// folder, in the bytes of the file system. Empty for the music folder itself.
    std::string playlist;
    /// The entry as the playlist has it, converted to UTF-8. Empty when the whole playlist or
    /// directory is left out, and for `NoAddress` and `TooManyEntries`.
    std::string entry;
    Reason reason = Reason::Missing;

    bool operator==(const LeftOut&) const = default;
};

/// `leftOut` as one line for a terminal, in the language that is followed: playlist, entry and
/// sentence. Valid UTF-8; control characters, which a hostile playlist could steer the terminal
/// with, are replaced.
[[nodiscard]] std::string describe(const LeftOut& leftOut);

/// The same of what is known by an explanation, and an entry that may be empty.
[[nodiscard]] std::string describe(const std::string& entry, const std::string& explanation);

} // namespace quorl::media
