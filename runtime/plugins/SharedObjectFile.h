#pragma once

#include <filesystem>
#include <optional>
#include <string>

namespace quorl {

/// What keeps `file` from being a shared object that this process can load, or null. A file that
/// was cut short would end the process while the loader maps it, so it is looked at first.
[[nodiscard]] std::optional<std::string> problemOfSharedObject(const std::filesystem::path& file);

} // namespace quorl
