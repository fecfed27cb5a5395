#pragma once

#include <filesystem>
#include <string>
#include <variant>

namespace quorl {

/// What `quorl` ends with; part of its interface, so the numbers stay as they are.
enum class ExitCode : int {
    Success = 0,
    Failure = 1,       ///< it could not do what it was asked to
    Usage = 2,         ///< the command line is wrong
    NoMusicFolder = 3, ///< `--library` only
};

/// What the command line asks for.
struct Options {
    enum class Mode { Window, Text, Screenshot, Library, Status };
    enum class Pane { Root, Playlist, Limit, Front };

    Mode mode = Mode::Window;
    std::filesystem::path music;      ///< the music folder; never empty
    std::filesystem::path wearable;   ///< a mounted wearable; empty for the embedded one
    bool json = false;                ///< of the status
    std::filesystem::path plugins;    ///< searched before all others; empty for none
    std::filesystem::path screenshot; ///< the picture to write
    int width = 360;                  ///< of the picture, in points
    int height = 720;
    double scale = 1; ///< device pixels to the point
    bool dark = false;
    Pane pane = Pane::Root;
};

/// What the arguments ask for, or what to end with at once: after `--help` and `--version`, which
/// are answered on standard output, and after a mistake, which is told on standard error.
[[nodiscard]] std::variant<Options, ExitCode> parseCommandLine(int argc, const char* const* argv);

} // namespace quorl
