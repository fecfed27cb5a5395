#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <variant>

#include "quorl/app/Picture.h"
#include "quorl/app/Places.h"
#include "quorl/process/ExitCode.h"

namespace quorl {

/// How much of the playlist is synced at most.
struct LimitChoice {
    std::uint64_t type = 0; ///< a `preferences::LimitType`
    std::uint64_t amount = 0;
};

/// What is to be done without showing anything, in this order.
struct Commands {
    std::optional<std::string> wearable; ///< for good: its name, its path, or "this-device"
    std::optional<std::string> music;    ///< the music folder, for good; empty for the usual one
    std::optional<std::string> playlist; ///< to be chosen: its name, its id, or "none"
    std::optional<LimitChoice> limit;    ///< to be chosen
    bool cancel = false;                 ///< the running sync
    bool sync = false;                   ///< now
    bool wait = false;                   ///< until all is on the wearable
};

/// What the command line asks for.
struct Options {
    enum class Mode { Window, Text, Screenshot, Library, Playlists, Wearables, Status, Commands };

    Mode mode = Mode::Window;
    Places places;
    Picture picture; ///< of the screenshot
    Commands commands;
    bool json = false; ///< of the status and the lists
};

/// What the arguments ask for, or what to end with at once: after `--help` and `--version`, which
/// are answered on standard output, and after a mistake, which is told on standard error, both in
/// the language that is followed.
[[nodiscard]] std::variant<Options, ExitCode> parseCommandLine(int argc, const char* const* argv);

} // namespace quorl
