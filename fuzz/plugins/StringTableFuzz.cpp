// Any bytes in the place of a string table that a bundle was made with: no text comes of them.

#include <bit>
#include <cstddef>
#include <cstdint>

#include "fuzz/Demand.h"
#include "fuzz/InputFile.h"
#include "runtime/plugins/StringTable.h"

namespace {

constexpr const char* name = "locale/de/LC_MESSAGES/default.mo";

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    static const quorl::fuzz::InputFile file(name);
    static const quorl::BundleFiles files(file.directory(), {{name, quorl::sha256("recorded")}});
    file.write({std::bit_cast<const char*>(data), size});
    const quorl::StringTable table(files);
    quorl::fuzz::demand(!table.text({"de"}, quorl::StringTable::defaultDomain, "MUSIC"));
    return 0;
}
