// Any bytes as the manifest of a wearable: they are rejected, or name files of the music directory
// only and are the same when they are written and read again. In the place of a generation they are
// no harm to the other one.

#include <algorithm>
#include <bit>
#include <cstddef>
#include <cstdint>

#include "fuzz/Demand.h"
#include "services/wearable/Generations.h"

namespace {

using quorl::wearable::Entry;
using quorl::wearable::Manifest;

bool isInMusicDirectory(const Entry& entry) {
    const auto name = entry.name();
    return !name.empty() && name != "." && name != ".." &&
           name.find_first_of(std::string_view("/\0", 2)) == std::string_view::npos;
}

Manifest readAgain(const Manifest& manifest, std::string_view otherGeneration) {
    const auto files = [&](std::string_view name) {
        return std::optional<std::string>(name == quorl::wearable::generationFiles[0]
                                              ? std::string(otherGeneration)
                                              : generationText(1, manifest));
    };
    return quorl::wearable::newestManifest(files).manifest;
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    using namespace quorl::wearable;
    const std::string_view bytes(std::bit_cast<const char*>(data), size);
    try {
        const Manifest manifest = parseManifest(bytes);
        quorl::fuzz::demand(std::ranges::all_of(manifest.songs, isInMusicDirectory));
        quorl::fuzz::demand(std::ranges::all_of(manifest.strays, isInMusicDirectory));
        quorl::fuzz::demand(!manifest.playlist || isInMusicDirectory(*manifest.playlist));
        quorl::fuzz::demand(readAgain(manifest, bytes) == manifest);
    } catch (const BadManifest& error) {
        quorl::fuzz::demand(!std::string_view(error.what()).empty());
    }
    return 0;
}
