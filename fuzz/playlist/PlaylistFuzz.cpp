// Feeds any bytes to the readers of playlists, as each format, and everything that comes of them to
// what reads entries and prints records. The texts have to be valid UTF-8, whatever the bytes.

#include <algorithm>
#include <bit>
#include <cstddef>
#include <cstdint>
#include <cstdlib>
#include <string>
#include <string_view>

#include <glib.h>

#include "fuzz/Demand.h"
#include "services/base/Utf8.h"
#include "services/media/playlists/EntryReadings.h"
#include "services/media/playlists/LeftOut.h"
#include "services/media/playlists/PlaylistContent.h"

namespace {

using quorl::fuzz::demand;

/// NULs, which GLib takes for the end of a text, are valid here.
bool isUtf8(std::string_view text) {
    std::string withoutNuls(text);
    std::ranges::replace(withoutNuls, '\0', ' ');
    return g_utf8_validate_len(withoutNuls.data(), withoutNuls.size(), nullptr) != FALSE;
}

void readAs(quorl::media::Format format, std::string_view bytes) {
    const auto content = quorl::media::parsePlaylist(format, bytes);
    if (!content) {
        return;
    }
    demand(isUtf8(content->name));
    for (std::uint32_t index = 0; index < content->entries.size(); ++index) {
        const std::string_view entry = content->entries[index];
        demand(isUtf8(entry));
        const auto read = quorl::media::readEntry(entry, format);
        if (const auto* const readings = std::get_if<quorl::media::EntryReadings>(&read)) {
            demand(!readings->empty());
            for (const std::string& path : *readings) {
                demand(path.find('\0') == std::string::npos);
                static_cast<void>(quorl::base::composed(path));
                static_cast<void>(quorl::base::decomposed(path));
            }
        }
        demand(isUtf8(
            quorl::media::describe({"List", std::string(entry), quorl::media::Reason::Missing})));
    }
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    const std::string_view bytes(std::bit_cast<const char*>(data), size);
    demand(isUtf8(quorl::base::printable(bytes)));
    readAs(quorl::media::Format::M3u, bytes);
    readAs(quorl::media::Format::Pls, bytes);
    readAs(quorl::media::Format::Xspf, bytes);
    return 0;
}
