#pragma once

#include <filesystem>
#include <variant>
#include <vector>

#include "platform/HostApp.h"

namespace quorl {

/// Why there is no pane to show: sentences for the user that name the file.
struct PaneProblem {
    std::string text;
};

using LoadedPane = std::variant<Class, PaneProblem>;

/// The class of the root pane of the first bundle in `directories`.
[[nodiscard]] LoadedPane loadPane(const std::vector<std::filesystem::path>& directories);

/// The classes of the root panes of all bundles in `directories`, of those of one name the first.
[[nodiscard]] std::vector<LoadedPane>
loadPanes(const std::vector<std::filesystem::path>& directories);

} // namespace quorl
