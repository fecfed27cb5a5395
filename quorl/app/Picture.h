#pragma once

#include <filesystem>

namespace quorl {

/// A picture of a pane that is wanted.
struct Picture {
    enum class Pane { Root, Playlist, Limit, Front };

    std::filesystem::path file; ///< to write; empty for no picture
    int width = 360;            ///< in points
    int height = 720;
    double scale = 1; ///< device pixels to the point
    bool isDark = false;
    Pane pane = Pane::Root;
};

} // namespace quorl
