#pragma once

#include <cstdint>
#include <filesystem>
#include <optional>

#include "services/base/Purpose.h"

namespace quorl::wearable {

/// What the wearable is called in every text.
inline constexpr const char* wearableName = "Velora";

/// The directory of a wearable that the songs and the playlist are in.
inline constexpr const char* musicDirectory = "Music";

/// The directory of a wearable in which we keep what we need to know about it. Nobody else's files
/// are in it.
inline constexpr const char* ownDirectory = ".quorl";

inline constexpr std::uint64_t embeddedCapacity = std::uint64_t{4} << 30;

/// A wearable that is a directory of this machine. A plain value; any thread.
struct Wearable {
    /// Absolute.
    std::filesystem::path root;

    /// What it holds at most, in bytes, of the one that is embedded in this machine. Nothing stands
    /// for a mounted device, which holds what its file system holds.
    std::optional<std::uint64_t> capacity;

    /// The directory was a mount point when it was chosen. When nothing is mounted there, the
    /// directory that is left is not the wearable.
    bool isMountPoint = false;

    bool operator==(const Wearable&) const = default;

    [[nodiscard]] bool isEmbedded() const { return capacity.has_value(); }

    /// The one in the user's data directory, which has another one for trials. It is made where it
    /// does not exist yet.
    [[nodiscard]] static Wearable embedded(base::Purpose purpose = base::Purpose::Use,
                                           std::uint64_t capacity = embeddedCapacity);
};

/// Whether something is mounted exactly at `directory`. False where it does not exist. Waits for
/// the device, so an unreachable network drive holds it up.
[[nodiscard]] bool isMountPoint(const std::filesystem::path& directory);

} // namespace quorl::wearable
