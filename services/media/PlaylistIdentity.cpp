#include "services/media/PlaylistIdentity.h"

#include <array>
#include <bit>
#include <string>

#include <glib.h>

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
    for (const char byte : bytes) {
        addByte(static_cast<unsigned char>(byte));
    }
    // Keeps "ab" and "c" apart from "a" and "bc": no path has a NUL.
    addByte(0);
}

void Fingerprint::add(std::uint64_t number) {
    for (unsigned shift = 0; shift < 64; shift += 8) {
        addByte(static_cast<unsigned char>(number >> shift & 0xFF));
    }
}

void Fingerprint::addByte(unsigned char byte) {
    // FNV-1a.
    value_ = (value_ ^ byte) * 0x100000001B3;
}

std::uint64_t fingerprint(const Song& song) {
    Fingerprint result;
    result.add(song.directory);
    result.add(song.name);
    result.add(song.size);
    result.add(static_cast<std::uint64_t>(song.modified));
    return result.value();
}

} // namespace quorl::media
