#pragma once

/// What the engine tells, as words for programs: codes of a `Message`. Behind each stand its
/// arguments, where it has any. The sentences are in Message.cpp.
namespace quorl::engine::code {

// What the engine does, or what it waits for.
inline constexpr auto syncOff = "sync-off";
inline constexpr auto noPlaylist = "no-playlist";
inline constexpr auto readingMusic = "reading-music";
inline constexpr auto playlistGone = "playlist-gone";
inline constexpr auto lookingForWearable = "looking-for-wearable";
inline constexpr auto notConnected = "not-connected";
inline constexpr auto notOnCharger = "not-on-charger";
inline constexpr auto syncing = "syncing";
inline constexpr auto stopping = "stopping"; ///< the message that says why
inline constexpr auto aboutToSync = "about-to-sync";
inline constexpr auto removing = "removing";
inline constexpr auto upToDate = "up-to-date";
inline constexpr auto upToDateBut = "up-to-date-but"; ///< how many songs were left out

// What became of a sync.
inline constexpr auto synced = "synced";        ///< how many songs
inline constexpr auto syncedBut = "synced-but"; ///< how many songs, and how many were left out
inline constexpr auto removed = "removed";
/// How many songs, the code of what is the matter with the first one, and that code's arguments.
inline constexpr auto songsLeftOut = "songs-left-out";
inline constexpr auto cancelled = "cancelled";
inline constexpr auto ended = "ended";
inline constexpr auto stopped = "stopped";
inline constexpr auto somethingElseChosen = "something-else-chosen";
inline constexpr auto anotherProgram = "another-program";
inline constexpr auto notEnoughMemory = "not-enough-memory";
inline constexpr auto notEnoughSpace = "not-enough-space"; ///< bytes needed, and bytes available

// What is the matter with the wearable.
inline constexpr auto wearableFull = "wearable-full";
inline constexpr auto writeProtected = "write-protected"; ///< what the system says
inline constexpr auto wentAway = "went-away";             ///< what the system says
inline constexpr auto obstructed = "obstructed";
inline constexpr auto notSynced = "not-synced"; ///< what the system says

// What is the matter with a song of the music folder: its path; nothing where it is known from
// elsewhere. Those of what a playlist names and the music folder has not are in
// services/media/playlists/LeftOut.cpp.
inline constexpr auto songGone = "song-gone";
inline constexpr auto songUnreadable = "song-unreadable"; ///< also what the system says
inline constexpr auto songNotAFile = "song-not-a-file";
inline constexpr auto songChanged = "song-changed";
inline constexpr auto songTooLarge = "song-too-large";

// Those of a wearable that cannot be looked at are in services/wearable/Unseen.h.

inline constexpr auto other = "other"; ///< a sentence

// Above what is told on the desktop of a sync.
inline constexpr auto titleSynced = "title-synced";
inline constexpr auto titleNotSynced = "title-not-synced";

} // namespace quorl::engine::code
