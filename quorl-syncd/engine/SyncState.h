#pragma once

namespace quorl::syncd {

/// What decides how far the chosen playlist has come.
struct SyncFacts {
    /// Sync is switched on, and a playlist was chosen.
    bool isWished = false;
    bool isLibraryRead = false;
    /// The chosen playlist is in the music folder.
    bool isPlaylistThere = false;
    /// It was sent as it is now.
    bool isSent = false;
    /// A session is under way.
    bool isRunning = false;
};

/// The value of the engine's property SyncState.
[[nodiscard]] const char* syncStateOf(const SyncFacts& facts);

} // namespace quorl::syncd
