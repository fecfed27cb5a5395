#pragma once

#include <optional>
#include <string>
#include <vector>

#include "services/base/MountTable.h"

namespace quorl::finding {

/// How a drive is made ready to be taken away, in the words of the disk service.
struct Removal {
    enum class Way {
        Unmount,  ///< Nothing is to be done once it is unmounted.
        Eject,    ///< Its medium is ejected.
        PowerOff, ///< It is switched off.
    };

    /// The object that is unmounted.
    std::string fileSystem = {};
    /// The object that is ejected or switched off.
    std::string drive = {};
    Way way = Way::Unmount;

    bool operator==(const Removal&) const = default;
};

/// A file system on a device of its own, as the system knows it, mounted or not. A plain value.
struct Drive {
    /// As in a `base::Mount`.
    std::string device = {};
    /// As in "/dev/sdb1".
    std::string node = {};
    /// Of the file system; empty where it is not known.
    std::string uuid = {};
    /// What people call it; empty where it has no name.
    std::string label = {};
    /// It comes and goes while the machine runs.
    bool isPluggable = false;
    /// Nothing where nobody can be asked to.
    std::optional<Removal> removal = {};

    bool operator==(const Drive&) const = default;
};

/// What is mounted at one moment, and what the system knows of it. A plain value.
struct Surroundings {
    std::vector<base::Mount> mounts = {};
    std::vector<Drive> drives = {};

    bool operator==(const Surroundings&) const = default;
};

/// The drive that is mounted there; null where that is none, or not known. Lives as long as
/// `drives`.
[[nodiscard]] const Drive* driveOf(const base::Mount& mount, const std::vector<Drive>& drives);

/// `told` and those of `seen` of which it says nothing.
[[nodiscard]] std::vector<Drive> joined(std::vector<Drive> told, const std::vector<Drive>& seen);

} // namespace quorl::finding
