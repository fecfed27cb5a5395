// Any bytes as a string table of a bundle, which was made with them: it is refused, or its texts
// are UTF-8.

#include <algorithm>
#include <bit>
#include <cstddef>
#include <cstdint>

#include <glib.h>

#include "fuzz/Demand.h"
#include "runtime/plugins/BundleError.h"
#include "runtime/plugins/Catalogue.h"

namespace {

bool isText(const quorl::Texts::value_type& entry) {
    return g_utf8_validate(entry.second.c_str(), -1, nullptr) != FALSE;
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    const std::filesystem::path file("default.mo");
    try {
        const auto texts = quorl::readCatalogue({std::bit_cast<const char*>(data), size}, file);
        quorl::fuzz::demand(std::ranges::all_of(texts, isText));
    } catch (const quorl::BundleError& error) {
        quorl::fuzz::demand(error.file() == file);
    }
    return 0;
}
