#pragma once

#include <filesystem>
#include <string_view>

namespace quorl::base {

/// Whether `path` is `root` or below it, by its text alone. Both absolute; `root` is empty for "/".
[[nodiscard]] inline bool isWithin(std::string_view path, std::string_view root) {
    return path.starts_with(root) && (path.size() == root.size() || path[root.size()] == '/');
}

/// `path` in its normal form, which has no slash at its end.
[[nodiscard]] inline std::filesystem::path normal(const std::filesystem::path& path) {
    const auto plain = path.lexically_normal();
    return plain.has_filename() ? plain : plain.parent_path();
}

} // namespace quorl::base
