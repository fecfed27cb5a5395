#include "services/media/PlaylistIdentity.h"

#include <array>
#include <bit>
#include <string>

#include <glib.h>
#include <xxhash.h>

#include "services/base/Utf8.h"

namespace quorl::media {

std::uint64_t playlistId(std::string_view path, bool folder) {
    std::string hashed = base::composed(path);
    if (folder) {
        hashed += '/';
    }
    GChecksum* const checksum = g_checksum_new(G_CHECKSUM_SHA256);
    g_checksum_update(checksum, std::bit_cast<const guchar*>(hashed.data()),
                      static_cast<gssize>(hashed.size()));
    std::array<guint8, 32> digest{};
    gsize size = digest.size();
    g_checksum_get_digest(checksum, digest.data(), &size);
    g_checksum_free(checksum);
    std::uint64_t id = 0;
    for (std::size_t index = 0; index < sizeof id; ++index) {
        id = id << 8 | digest[index];
    }
    return id == 0 ? 1 : id;
}

void Fingerprint::add(std::string_view bytes) {
    value_ = XXH3_64bits_withSeed(bytes.data(), bytes.size(), value_);
}

void Fingerprint::add(std::uint64_t number) {
    const auto bytes = std::bit_cast<std::array<char, sizeof number>>(GUINT64_TO_LE(number));
    add(std::string_view(bytes.data(), bytes.size()));
}

Fingerprint fingerprintOf(std::string_view directory) {
    Fingerprint result;
    result.add(directory);
    return result;
}

std::uint64_t fingerprint(Fingerprint directory, const Song& song) {
    directory.add(song.name);
    directory.add(song.size);
    directory.add(static_cast<std::uint64_t>(song.modified));
    return directory.value();
}

} // namespace quorl::media
