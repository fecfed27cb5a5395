#pragma once

#include <variant>

#include "quorl/app/ExitCode.h"
#include "quorl/app/Picture.h"
#include "quorl/app/Places.h"

namespace quorl {

/// What the command line asks for.
struct Options {
    enum class Mode { Window, Text, Screenshot, Library, Status };

    Mode mode = Mode::Window;
    Places places;
    Picture picture;   ///< of the screenshot
    bool json = false; ///< of the status
};

/// What the arguments ask for, or what to end with at once: after `--help` and `--version`, which
/// are answered on standard output, and after a mistake, which is told on standard error.
[[nodiscard]] std::variant<Options, ExitCode> parseCommandLine(int argc, const char* const* argv);

} // namespace quorl
