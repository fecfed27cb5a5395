#pragma once

namespace quorl {

/// What `quorl` ends with; part of its interface, so the numbers stay as they are.
enum class ExitCode : int {
    Success = 0,
    Failure = 1,       ///< it could not do what it was asked to
    Usage = 2,         ///< the command line is wrong
    NoMusicFolder = 3, ///< `--library` and `--playlists` only
};

} // namespace quorl
