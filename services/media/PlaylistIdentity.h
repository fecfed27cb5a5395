#pragma once

#include <cstdint>
#include <string_view>

#include "services/media/Inventory.h"

namespace quorl::media {

/// The id of the playlist, or with `folder` of the folder, at `path` relative to the music folder:
/// the first eight bytes, as a big-endian number, of the SHA-256 of the path in normalisation form
/// C; for a folder, of the path and a slash. 1 in place of 0.
[[nodiscard]] std::uint64_t playlistId(std::string_view path, bool folder);

/// A hash that only depends on what is added, in its order; the same on every machine. Tells states
/// of a playlist apart; does not withstand somebody who looks for two with the same hash.
class Fingerprint {
  public:
    void add(std::string_view bytes);
    void add(std::uint64_t number);

    [[nodiscard]] std::uint64_t value() const { return value_; }

  private:
    std::uint64_t value_ = 0;
};

/// What all songs in the directory at this path, relative to the music folder, have in common.
[[nodiscard]] Fingerprint fingerprintOf(std::string_view directory);

/// What `song` adds to the revision of a playlist: its path, size and modification time. Of its
/// path only the name is taken from it, the rest from `directory`.
[[nodiscard]] std::uint64_t fingerprint(Fingerprint directory, const Song& song);

} // namespace quorl::media
