#include "quorl/app/Printing.h"

#include <iostream>

#include "services/base/Utf8.h"

namespace quorl {

ExitCode tellMissingMusicFolder(const std::filesystem::path& root) {
    std::cerr << "quorl: There is no music folder at " << base::printable(root.string())
              << ". Create it, or name another one with --music.\n";
    return ExitCode::NoMusicFolder;
}

ExitCode finishPrinting() {
    std::cout.flush();
    if (!std::cout) {
        std::cerr << "quorl: The list could not be written to standard output.\n";
        return ExitCode::Failure;
    }
    return ExitCode::Success;
}

} // namespace quorl
