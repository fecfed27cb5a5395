// Any bytes as the shared object of a bundle, which was made with them.

#include <bit>
#include <cstddef>
#include <cstdint>

#include "fuzz/Demand.h"
#include "fuzz/InputFile.h"
#include "runtime/plugins/SharedObjectFile.h"

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    static const quorl::fuzz::InputFile file("plugin.so");
    const std::string_view bytes(std::bit_cast<const char*>(data), size);
    file.write(bytes);
    const auto problem = quorl::problemOfSharedObject(file.path());
    quorl::fuzz::demand(problem || bytes.starts_with("\x7f"
                                                     "ELF"));
    return 0;
}
