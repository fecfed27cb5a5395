#include "services/wearable/Usage.h"

#include <algorithm>
#include <cerrno>
#include <system_error>

#include <fcntl.h>
#include <sys/statvfs.h>

#include "services/base/AtomicFile.h"
#include "services/base/FileStatus.h"
#include "services/wearable/ContentHash.h"
#include "services/wearable/Generations.h"

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

std::string pathOf(const Entry& entry) {
    return std::string{musicDirectory}.append("/").append(entry.name());
}

/// Somebody's own playlist may be as large as ours. What cannot be read is not as it was.
bool hasContentsOf(int root, const Entry& playlist) {
    try {
        return hashOf(base::readFile(root, pathOf(playlist))) == playlist.hash;
    } catch (const std::system_error&) {
        return false;
    }
}

/// What of a manifest is on the device, by the sizes of its files.
struct Stock {
    std::uint64_t songBytes = 0;
    std::uint64_t songCount = 0;
    bool isComplete = true;
};

Stock stockOf(int root, const Manifest& manifest) {
    Stock stock;
    const auto look = [root, &stock](const Entry& entry) -> std::optional<std::uint64_t> {
        base::FileStatus status{};
        const bool isThere =
            fstatat(root, pathOf(entry).c_str(), &status, AT_SYMLINK_NOFOLLOW) == 0 &&
            S_ISREG(status.st_mode);
        const auto bytes = isThere ? std::optional(base::stateOf(status).size) : std::nullopt;
        stock.isComplete = stock.isComplete && bytes == entry.size;
        return bytes;
    };
    for (const auto& song : manifest.songs) {
        const auto bytes = look(song);
        stock.songBytes += bytes.value_or(0);
        stock.songCount += bytes ? 1 : 0;
    }
    if (manifest.playlist) {
        static_cast<void>(look(*manifest.playlist));
        stock.isComplete = stock.isComplete && hasContentsOf(root, *manifest.playlist);
    }
    return stock;
}

FileDescriptor openWearable(const Wearable& wearable) {
    if (wearable.isEmbedded()) {
        base::makeDirectories(wearable.root);
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
        const auto stock = stockOf(root.get(), manifest);
        return {wearable.capacity.value_or(spaceOf(root.get()).total),
                availableBytes(wearable, root.get()), stock.songBytes, stock.songCount,
                stock.isComplete ? manifest.sent : std::nullopt};
    } catch (const std::system_error& error) {
        const auto why = error.code().message();
        throw CannotBeSeen{{unseen::unreachable, {wearable.root.string(), why}},
                           "The " + std::string{wearableName} + " at " + wearable.root.string() +
                               " cannot be reached: " + why + "."};
    }
}

} // namespace quorl::wearable
