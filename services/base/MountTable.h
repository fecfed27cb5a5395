#pragma once

#include <filesystem>
#include <string>
#include <string_view>
#include <vector>

namespace quorl::base {

/// A file system that is mounted somewhere, as the kernel tells of it. A plain value.
struct Mount {
    /// Tells it from all others that are there at the same time; another one may get it later.
    std::string id = {};
    /// Major and minor number of the device, as in "8:17"; the major one is 0 where there is none.
    std::string device = {};
    /// Which directory of the file system is mounted; "/" for all of it.
    std::filesystem::path root = {};
    /// Where it is mounted. Absolute.
    std::filesystem::path directory = {};
    bool isReadOnly = false;
    /// As in "vfat" and "tmpfs".
    std::string type = {};
    /// What was mounted, in the words of whoever did it: "/dev/sdb1", "server:/music", "none".
    std::string source = {};

    bool operator==(const Mount&) const = default;
};

/// What /proc/self/mountinfo says, in its order: of two at one directory, the later one hides the
/// other. Lines that say something else are left out.
[[nodiscard]] std::vector<Mount> mountsIn(std::string_view table);

/// The mount that a file at this absolute path is on, by the text of the path alone; null where the
/// table does not say. Lives as long as `mounts`.
[[nodiscard]] const Mount* mountOver(const std::filesystem::path& path,
                                     const std::vector<Mount>& mounts);

} // namespace quorl::base
