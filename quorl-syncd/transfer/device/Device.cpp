#include "quorl-syncd/transfer/device/Device.h"

#include <algorithm>
#include <cerrno>
#include <cstdio>
#include <memory>
#include <optional>
#include <system_error>

#include <dirent.h>
#include <fcntl.h>
#include <sys/file.h>
#include <sys/stat.h>

#include "quorl-syncd/transfer/SongSource.h"
#include "services/base/AtomicFile.h"
#include "services/wearable/Usage.h"

namespace quorl::syncd {

namespace {

using base::FileDescriptor;
using wearable::Entry;

constexpr std::string_view unfinishedEnding = ".part";
constexpr auto smallFile = "small";

[[noreturn]] void fail(const std::string& what) {
    throw std::system_error{errno, std::generic_category(), what};
}

FileDescriptor openWearable(const wearable::Wearable& wearable) {
    if (wearable.isMountPoint && !wearable::isMountPoint(wearable.root)) {
        errno = ENODEV;
        fail(wearable.root);
    }
    return base::openRoot(wearable.root.c_str());
}

std::vector<std::string> namesIn(int directory) {
    struct Close {
        void operator()(DIR* stream) const { closedir(stream); }
    };

    FileDescriptor copy{openat(directory, ".", O_RDONLY | O_DIRECTORY | O_CLOEXEC)};
    const std::unique_ptr<DIR, Close> stream{copy ? fdopendir(copy.get()) : nullptr};
    if (!stream) {
        fail("opendir");
    }
    static_cast<void>(copy.release());
    std::vector<std::string> names;
    errno = 0;
    while (const auto* entry = readdir(stream.get())) {
        names.emplace_back(entry->d_name);
    }
    if (errno != 0) {
        fail("readdir");
    }
    return names;
}

/// Nothing where there is no regular file of that name.
std::optional<FileState> fileAt(int directory, const std::string& name) {
    struct stat status {};

    if (fstatat(directory, name.c_str(), &status, AT_SYMLINK_NOFOLLOW) != 0) {
        if (errno == ENOENT) {
            return std::nullopt;
        }
        fail(name);
    }
    return S_ISREG(status.st_mode) ? std::optional{stateOf(status)} : std::nullopt;
}

/// FAT keeps times to two seconds.
bool isSameTime(std::int64_t first, std::int64_t second) {
    constexpr std::uint64_t tolerance = 2'000'000'000;
    const auto [earlier, later] = std::minmax({first, second});
    // Unsigned, for a manifest may name times that are further apart than an int64_t can say.
    return static_cast<std::uint64_t>(later) - static_cast<std::uint64_t>(earlier) <= tolerance;
}

} // namespace

Device::Device(const wearable::Wearable& wearable)
    : wearable_{wearable},
      root_{openWearable(wearable)},
      music_{base::openDirectory(root_.get(), wearable::musicDirectory)},
      own_{base::openDirectory(root_.get(), wearable::ownDirectory)} {
    if (flock(own_.get(), LOCK_EX | LOCK_NB) != 0 && errno == EWOULDBLOCK) {
        throw std::runtime_error{"Another program is syncing to this " +
                                 std::string{wearable::wearableName} +
                                 ". Wait until it is done, or end it."};
    }
}

std::uint64_t Device::available() const { return wearable::availableBytes(wearable_, root_.get()); }

std::vector<std::string> Device::musicNames() const { return namesIn(music_.get()); }

bool Device::has(const Entry& entry) const {
    const auto state = fileAt(music_.get(), entry.name);
    return state && state->size == entry.size;
}

bool Device::hasFile(const std::string& name) const {
    return fileAt(music_.get(), name).has_value();
}

bool Device::isOurs(const Entry& stray) const {
    const auto state = fileAt(music_.get(), stray.name);
    if (!state || state->size != stray.size) {
        return false;
    }
    return isSameTime(state->modified, stray.modified) ||
           (!stray.hash.empty() && hashOf(openMusic(stray.name).get(), {}) == stray.hash);
}

FileDescriptor Device::openMusic(const std::string& name) const {
    FileDescriptor file{
        openat(music_.get(), name.c_str(), O_RDONLY | O_NOFOLLOW | O_NONBLOCK | O_CLOEXEC)};
    if (!file) {
        fail(name);
    }
    return file;
}

void Device::removeMusic(const std::string& name) const {
    if (unlinkat(music_.get(), name.c_str(), 0) != 0 && errno != ENOENT) {
        fail(name);
    }
}

FileDescriptor Device::createUnfinished(const std::string& name) const {
    constexpr mode_t forEverybodyToRead = 0644;
    FileDescriptor file{openat(own_.get(), (name + std::string{unfinishedEnding}).c_str(),
                               O_WRONLY | O_CREAT | O_TRUNC | O_NOFOLLOW | O_CLOEXEC,
                               forEverybodyToRead)};
    if (!file) {
        fail(name);
    }
    return file;
}

void Device::finish(const std::string& unfinished, const std::string& name) const {
    const auto from = unfinished + std::string{unfinishedEnding};
    if (renameat2(own_.get(), from.c_str(), music_.get(), name.c_str(), RENAME_NOREPLACE) == 0) {
        return;
    }
    if (errno != EINVAL && errno != ENOSYS) {
        fail(name);
    }
    // A file system that cannot rename without replacing.
    if (faccessat(music_.get(), name.c_str(), F_OK, AT_SYMLINK_NOFOLLOW) == 0) {
        errno = EEXIST;
        fail(name);
    }
    if (renameat(own_.get(), from.c_str(), music_.get(), name.c_str()) != 0) {
        fail(name);
    }
}

void Device::removeUnfinished() const {
    for (const auto& name : namesIn(own_.get())) {
        if (name.ends_with(unfinishedEnding) && unlinkat(own_.get(), name.c_str(), 0) != 0) {
            fail(name);
        }
    }
}

void Device::syncMusic() const { base::syncToDevice(music_.get()); }

void Device::writeUnfinished(const std::string& name, std::string_view text) const {
    const auto file = createUnfinished(name);
    writeAll(file.get(), std::as_bytes(std::span{text}));
    base::syncToDevice(file.get());
}

void Device::writeMusic(const std::string& name, std::string_view text) const {
    writeUnfinished(smallFile, text);
    finish(smallFile, name);
    syncMusic();
}

void Device::replaceMusic(const std::string& name, std::string_view text) const {
    writeUnfinished(smallFile, text);
    const auto from = std::string{smallFile}.append(unfinishedEnding);
    if (renameat(own_.get(), from.c_str(), music_.get(), name.c_str()) != 0) {
        fail(name);
    }
    syncMusic();
}

} // namespace quorl::syncd
