#pragma once

#include <cstdint>
#include <optional>

namespace quorl::syncd {

/// A playlist in a certain state.
struct SentPlaylist {
    std::uint64_t playlist = 0;
    std::uint64_t revision = 0;

    bool operator==(const SentPlaylist&) const = default;
};

/// What the preferences say.
struct Choices {
    bool isSyncEnabled = false;
    /// The chosen playlist.
    std::optional<std::uint64_t> playlist;
    std::uint64_t limitType = 0;
    std::uint64_t limit = 0;
    /// What was last sent in full; nothing also where only a part of it is known.
    std::optional<SentPlaylist> lastSent;

    bool operator==(const Choices&) const = default;
};

} // namespace quorl::syncd
