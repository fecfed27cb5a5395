// Any bytes as the manifest of a wearable: they are rejected, or name files of the music directory
// only and are the same when they are written and read again.

#include <algorithm>
#include <bit>
#include <cstddef>
#include <cstdint>

#include "fuzz/Demand.h"
#include "services/wearable/Manifest.h"

namespace {

using quorl::wearable::Entry;

bool isInMusicDirectory(const Entry& entry) {
    return !entry.name.empty() && entry.name != "." && entry.name != ".." &&
           entry.name.find_first_of(std::string_view("/\0", 2)) == std::string::npos;
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    using namespace quorl::wearable;
    try {
        const Manifest manifest = parseManifest({std::bit_cast<const char*>(data), size});
        quorl::fuzz::demand(std::ranges::all_of(manifest.songs, isInMusicDirectory));
        quorl::fuzz::demand(std::ranges::all_of(manifest.strays, isInMusicDirectory));
        quorl::fuzz::demand(!manifest.playlist || isInMusicDirectory(*manifest.playlist));
        quorl::fuzz::demand(parseManifest(toText(manifest)) == manifest);
    } catch (const BadManifest& error) {
        quorl::fuzz::demand(!std::string_view(error.what()).empty());
    }
    return 0;
}
