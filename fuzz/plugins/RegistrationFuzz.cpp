// Any bytes as the registration of a bundle: it is refused, or says all that a registration says.

#include <bit>
#include <cstddef>
#include <cstdint>

#include "fuzz/Demand.h"
#include "fuzz/InputFile.h"
#include "runtime/plugins/PluginBundle.h"

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    static const quorl::fuzz::InputFile file("registration.json");
    file.write({std::bit_cast<const char*>(data), size});
    try {
        const auto bundle = quorl::PluginBundle::open(file.directory());
        const auto& registration = bundle->registration();
        quorl::fuzz::demand(!registration.identifier.empty() && !registration.rootClass.empty());
        quorl::fuzz::demand(registration.library.find('/') == std::string::npos);
    } catch (const quorl::BundleError& error) {
        quorl::fuzz::demand(error.file() == file.path());
    }
    return 0;
}
