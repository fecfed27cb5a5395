#include "services/wearable/Usage.h"

#include <algorithm>
#include <cerrno>
#include <system_error>

#include <fcntl.h>
#include <sys/stat.h>
#include <sys/statvfs.h>

#include "services/base/AtomicFile.h"

namespace quorl::wearable {

namespace {

using base::FileDescriptor;

struct Space {
    std::uint64_t total = 0;
    std::uint64_t available = 0;
};

Space spaceOf(int root) {
    struct statvfs status {};

    if (fstatvfs(root, &status) != 0) {
        throw std::system_error{errno, std::generic_category(), "statvfs"};
    }
    const std::uint64_t block = status.f_frsize;
    return {status.f_blocks * block, status.f_bavail * block};
}

/// Files that go away while they are counted count as nothing.
std::uint64_t bytesBelow(const std::filesystem::path& root) {
    std::error_code ignored;
    std::uint64_t bytes = 0;
    using Walk = std::filesystem::recursive_directory_iterator;
    for (Walk at{root, ignored}, end; !ignored && at != end; at.increment(ignored)) {
        std::error_code gone;
        if (at->is_regular_file(gone) && !at->is_symlink(gone)) {
            const auto size = at->file_size(gone);
            bytes += gone ? 0 : size;
        }
    }
    return bytes;
}

std::uint64_t bytesThere(int root, const std::vector<Entry>& songs) {
    std::uint64_t bytes = 0;
    for (const auto& song : songs) {
        const auto path = std::string{musicDirectory} + "/" + song.name;

        struct stat status {};

        if (fstatat(root, path.c_str(), &status, AT_SYMLINK_NOFOLLOW) == 0 &&
            S_ISREG(status.st_mode)) {
            bytes += static_cast<std::uint64_t>(status.st_size);
        }
    }
    return bytes;
}

FileDescriptor openWearable(const Wearable& wearable) {
    if (wearable.isEmbedded()) {
        std::filesystem::create_directories(wearable.root);
    }
    if (wearable.isMountPoint && !isMountPoint(wearable.root)) {
        throw std::system_error{ENODEV, std::generic_category()};
    }
    return base::openRoot(wearable.root.c_str());
}

} // namespace

std::uint64_t availableBytes(const Wearable& wearable, int root) {
    const auto space = spaceOf(root).available;
    if (!wearable.capacity) {
        return space;
    }
    const auto used = std::min(bytesBelow(wearable.root), *wearable.capacity);
    return std::min(space, *wearable.capacity - used);
}

Usage readUsage(const Wearable& wearable) {
    try {
        const auto root = openWearable(wearable);
        const auto manifest = loadManifest(root.get());
        return {wearable.capacity.value_or(spaceOf(root.get()).total),
                availableBytes(wearable, root.get()), bytesThere(root.get(), manifest.songs),
                manifest.sent};
    } catch (const std::system_error& error) {
        throw std::runtime_error{"The " + std::string{wearableName} + " at " +
                                 wearable.root.string() +
                                 " cannot be reached: " + error.code().message() + "."};
    }
}

} // namespace quorl::wearable
