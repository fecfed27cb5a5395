#include "quorl/app/Printing.h"

#include <iostream>

#include "quorl/facts/FolderTrouble.h"
#include "services/language/Translated.h"

namespace quorl {

ExitCode tellFolderTrouble(const media::Inventory& inventory) {
    if (const auto trouble = troubleIn(inventory); !trouble.empty()) {
        std::cerr << "quorl: " << trouble << '\n';
    }
    return !inventory.rootFound      ? ExitCode::NoMusicFolder
           : isUnreadable(inventory) ? ExitCode::Failure
                                     : ExitCode::Success;
}

ExitCode finishPrinting() {
    std::cout.flush();
    if (!std::cout) {
        std::cerr << "quorl: "
                  << language::translated("The list could not be written to standard output.")
                  << '\n';
        return ExitCode::Failure;
    }
    return ExitCode::Success;
}

} // namespace quorl
