#pragma once

#include <filesystem>

#include "services/finding/Drive.h"

namespace quorl::finding {

/// What the kernel's and the system's own files tell of mounts and drives: /proc/self/mountinfo,
/// /sys/class/block and /dev/disk. Waits for no device. What cannot be read tells nothing.
/// @param root of the file system that they are in; "/" but for tests.
[[nodiscard]] Surroundings surroundingsIn(const std::filesystem::path& root);

} // namespace quorl::finding
