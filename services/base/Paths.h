#pragma once

#include <string_view>

namespace quorl::base {

/// Whether `path` is `root` or below it, by its text alone. Both absolute; `root` is empty for "/".
[[nodiscard]] inline bool isWithin(std::string_view path, std::string_view root) {
    return path.starts_with(root) && (path.size() == root.size() || path[root.size()] == '/');
}

} // namespace quorl::base
