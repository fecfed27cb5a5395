#include "services/finding/Place.h"

#include <algorithm>
#include <array>
#include <set>
#include <string_view>
#include <system_error>

#include <fcntl.h>
#include <sys/stat.h>
#include <sys/statvfs.h>

#include "services/base/FileDescriptor.h"
#include "services/base/FileStatus.h"
#include "services/base/Paths.h"
#include "services/wearable/Generations.h"
#include "services/wearable/Wearable.h"

namespace quorl::finding {

namespace {

namespace fs = std::filesystem;

/// Of the kernel itself, or mounted by a look.
constexpr std::array<std::string_view, 22> withoutFiles{
    "autofs",    "binfmt_misc", "bpf",      "cgroup",   "cgroup2", "configfs",
    "debugfs",   "devpts",      "devtmpfs", "efivarfs", "fusectl", "hugetlbfs",
    "mqueue",    "nsfs",        "proc",     "pstore",   "ramfs",   "rpc_pipefs",
    "selinuxfs", "securityfs",  "sysfs",    "tracefs"};

/// Where the system has its own files, on whatever drive.
constexpr std::array<std::string_view, 10> systemDirectories{
    "/boot", "/efi", "/etc", "/gnu", "/home", "/nix", "/opt", "/srv", "/usr", "/var"};

/// Where a desktop mounts what is plugged in.
constexpr std::array<std::string_view, 2> directoriesForDrives{"/media", "/run/media"};

/// A device has more of them than anybody would look through.
constexpr std::size_t mostDirectories = 1000;

template <std::size_t size>
bool isInOneOf(const std::array<std::string_view, size>& directories, const fs::path& path) {
    return std::ranges::any_of(directories, [&path](std::string_view directory) {
        return base::isWithin(path.native(), directory);
    });
}

bool isImage(const base::Mount& mount) { return mount.source.starts_with("/dev/loop"); }

/// Without knowing the drive, what a desktop has mounted from a device is one.
bool isPluggedIn(const base::Mount& mount, const Drive* drive) {
    return drive != nullptr && drive->isPluggable
               ? true
               : mount.source.starts_with("/dev/") &&
                     isInOneOf(directoriesForDrives, mount.directory);
}

bool isOfSystem(const base::Mount& mount) {
    return mount.directory == "/" || isInOneOf(systemDirectories, mount.directory);
}

bool mayHoldWearable(const base::Mount& mount) {
    return !mount.isReadOnly && std::ranges::find(withoutFiles, mount.type) == withoutFiles.end();
}

Place placeOf(const base::Mount& mount, const Drive* drive) {
    const bool isDrive = isPluggedIn(mount, drive) && !isOfSystem(mount) && !isImage(mount);
    return {mount.directory, isDrive, isDrive};
}

bool hasManifest(const fs::path& directory) {
    const base::FileDescriptor own(
        open((directory / wearable::ownDirectory).c_str(),
             O_RDONLY | O_DIRECTORY | O_NOFOLLOW | O_NONBLOCK | O_CLOEXEC));
    const auto isThere = [&own](const char* file) {
        base::FileStatus status{};
        return fstatat(own.get(), file, &status, AT_SYMLINK_NOFOLLOW) == 0 &&
               S_ISREG(status.st_mode);
    };
    return own && (std::ranges::any_of(wearable::generationFiles, isThere) ||
                   isThere(wearable::formerManifestFile));
}

std::vector<fs::path> directoriesIn(const fs::path& directory) {
    std::vector<fs::path> directories;
    std::error_code error;
    for (fs::directory_iterator at(directory, error), end;
         !error && at != end && directories.size() < mostDirectories; at.increment(error)) {
        std::error_code gone;
        if (at->is_directory(gone) && !at->is_symlink(gone)) {
            directories.push_back(at->path());
        }
    }
    std::ranges::sort(directories);
    return directories;
}

std::optional<Space> spaceOf(const fs::path& directory) {
    struct statvfs status {};

    if (statvfs(directory.c_str(), &status) != 0) {
        return std::nullopt;
    }
    const std::uint64_t block = status.f_frsize;
    return Space{status.f_blocks * block, status.f_bavail * block};
}

} // namespace

std::vector<Place> placesIn(const Surroundings& surroundings, const fs::path& home) {
    std::vector<Place> places;
    std::set<std::string> drives;
    for (const auto& mount : surroundings.mounts) {
        const auto* const drive = driveOf(mount, surroundings.drives);
        const bool isHidden = base::mountOver(mount.directory, surroundings.mounts) != &mount;
        const auto place = placeOf(mount, drive);
        const bool isCopy =
            place.isOfferedEmpty && (mount.root != "/" || !drives.insert(mount.device).second);
        if (!isHidden && !isCopy && mayHoldWearable(mount)) {
            places.push_back(place);
        }
    }
    if (!home.empty()) {
        places.push_back({home, false, true});
    }
    return places;
}

Find lookAt(const Place& place) {
    Find found{spaceOf(place.directory), {}};
    if (hasManifest(place.directory)) {
        found.wearables.push_back(place.directory);
    }
    if (place.isLookedInto) {
        const auto directories = directoriesIn(place.directory);
        std::ranges::copy_if(directories, std::back_inserter(found.wearables), hasManifest);
    }
    return found;
}

} // namespace quorl::finding
