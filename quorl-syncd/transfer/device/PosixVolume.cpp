#include "quorl-syncd/transfer/device/PosixVolume.h"

#include <algorithm>
#include <cerrno>
#include <cstdio>
#include <system_error>
#include <utility>

#include <dirent.h>
#include <fcntl.h>
#include <linux/fs.h>
#include <linux/magic.h>
#include <strings.h>
#include <sys/file.h>
#include <sys/ioctl.h>
#include <sys/stat.h>
#include <sys/vfs.h>
#include <unistd.h>

#include "quorl-syncd/transfer/SyncProblem.h"
#include "services/base/AtomicFile.h"
#include "services/base/FileContents.h"
#include "services/engine/Codes.h"
#include "services/wearable/Usage.h"

namespace quorl::syncd {

namespace {

using base::FileDescriptor;

[[noreturn]] void fail(const std::string& what) {
    throw std::system_error(errno, std::generic_category(), what);
}

FileDescriptor openWearable(const wearable::Wearable& wearable) {
    if (wearable.isMountPoint && !wearable::isMountPoint(wearable.root)) {
        errno = ENODEV;
        fail(wearable.root);
    }
    return base::openRoot(wearable.root.c_str());
}

bool isFat(int root) {
    struct statfs status {};

    if (fstatfs(root, &status) != 0) {
        fail("statfs");
    }
    return status.f_type == MSDOS_SUPER_MAGIC || status.f_type == EXFAT_SUPER_MAGIC;
}

void syncVolumeOf(int descriptor) {
    if (syncfs(descriptor) != 0) {
        fail("syncfs");
    }
}

std::vector<std::string> namesIn(int directory) {
    struct Close {
        void operator()(DIR* stream) const { closedir(stream); }
    };

    FileDescriptor copy(openat(directory, ".", O_RDONLY | O_DIRECTORY | O_CLOEXEC));
    const std::unique_ptr<DIR, Close> stream(copy ? fdopendir(copy.get()) : nullptr);
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

class PosixReader final : public base::Reader {
  public:
    explicit PosixReader(FileDescriptor file) : file_(std::move(file)) {}

    [[nodiscard]] std::size_t read(std::span<std::byte> buffer) override {
        return base::readSome(file_.get(), buffer);
    }

  private:
    FileDescriptor file_;
};

class PosixVolumeFile final : public VolumeFile {
  public:
    PosixVolumeFile(FileDescriptor file, bool isOnFat)
        : file_(std::move(file)), isOnFat_(isOnFat) {}

    [[nodiscard]] bool share(int descriptor) override {
        return descriptor >= 0 && ioctl(file_.get(), FICLONE, descriptor) == 0;
    }

    void write(std::span<const std::byte> bytes) override { base::writeAll(file_.get(), bytes); }

    void setModified(std::int64_t nanoseconds) override {
        const auto time = base::timeOf(nanoseconds);
        const timespec times[]{time, time};
        // Some devices keep no times; the copy is none the worse.
        static_cast<void>(futimens(file_.get(), times));
    }

    void flush() override {
        // Only what can be begun early is; `sync` tells what went wrong.
        static_cast<void>(sync_file_range(file_.get(), 0, 0, SYNC_FILE_RANGE_WRITE));
    }

    void sync() override {
        if (isOnFat_) {
            syncVolumeOf(file_.get());
        }
        base::syncToDevice(file_.get());
    }

  private:
    FileDescriptor file_;
    const bool isOnFat_;
};

const char* nameOf(Volume::Directory directory) {
    switch (directory) {
    case Volume::Directory::Music:
        return wearable::musicDirectory;
    case Volume::Directory::Own:
        return wearable::ownDirectory;
    case Volume::Directory::Top:
        break;
    }
    return ".";
}

void renameUnlessTaken(int directory, const char* name, const char* newName) {
    if (renameat2(directory, name, directory, newName, RENAME_NOREPLACE) == 0) {
        return;
    }
    if (errno != EINVAL && errno != ENOSYS) {
        fail(newName);
    }
    // A file system that cannot rename without replacing.
    if (faccessat(directory, newName, F_OK, AT_SYMLINK_NOFOLLOW) == 0) {
        errno = EEXIST;
        fail(newName);
    }
    if (renameat(directory, name, directory, newName) != 0) {
        fail(newName);
    }
}

/// False: there is something of that name already.
bool make(int root, const std::string& name, mode_t mode) {
    if (mkdirat(root, name.c_str(), mode) == 0) {
        return true;
    }
    if (errno != EEXIST) {
        fail(name);
    }
    return false;
}

/// For a directory that does not have its name yet. What an earlier try has left may be broken, so
/// that even to look for it would be an error.
std::string freeNameOnFat(int root) {
    const auto names = namesIn(root);
    for (int number = 1;; ++number) {
        auto name = "QUORL" + std::to_string(number) + ".NEW";
        const auto isSame = [&](const std::string& other) {
            return strcasecmp(name.c_str(), other.c_str()) == 0;
        };
        if (std::ranges::none_of(names, isSame)) {
            return name;
        }
    }
}

bool makeOnFat(int root, const char* name, mode_t mode) {
    if (faccessat(root, name, F_OK, AT_SYMLINK_NOFOLLOW) == 0) {
        return false;
    }
    const auto unfinished = freeNameOnFat(root);
    static_cast<void>(make(root, unfinished, mode));
    syncVolumeOf(root);
    renameUnlessTaken(root, unfinished.c_str(), name);
    syncVolumeOf(root);
    return true;
}

/// False: it is there already.
bool make(int root, Volume::Directory directory, bool isOnFat) {
    constexpr mode_t forEverybodyToRead = 0755;
    constexpr mode_t forItsOwner = 0700;
    const auto mode = directory == Volume::Directory::Own ? forItsOwner : forEverybodyToRead;
    return isOnFat ? makeOnFat(root, nameOf(directory), mode) : make(root, nameOf(directory), mode);
}

/// Never follows a symbolic link out of the wearable.
FileDescriptor openDirectory(int root, Volume::Directory directory) {
    FileDescriptor opened(
        openat(root, nameOf(directory), O_RDONLY | O_DIRECTORY | O_NOFOLLOW | O_CLOEXEC));
    if (!opened) {
        fail(nameOf(directory));
    }
    return opened;
}

/// Opening never waits for a pipe.
FileDescriptor openFile(int directory, const std::string& name, int access) {
    FileDescriptor file(
        openat(directory, name.c_str(), access | O_NOFOLLOW | O_NONBLOCK | O_CLOEXEC));
    base::FileStatus status{};
    if (!file || fstat(file.get(), &status) != 0) {
        fail(name);
    }
    if (!S_ISREG(status.st_mode)) {
        errno = EINVAL;
        fail(name);
    }
    return file;
}

} // namespace

PosixVolume::PosixVolume(const wearable::Wearable& wearable)
    : wearable_(wearable),
      root_(openWearable(wearable)),
      isFat_(isFat(root_.get())),
      isOwnNew_(lockOwn()) {}

/// True: it was made.
bool PosixVolume::lockOwn() {
    const bool isNew = make(root_.get(), Directory::Own, isFat_);
    own_ = openDirectory(root_.get(), Directory::Own);
    if (flock(own_.get(), LOCK_EX | LOCK_NB) != 0 && errno == EWOULDBLOCK) {
        throw SyncProblem({engine::code::anotherProgram});
    }
    return isNew;
}

int PosixVolume::descriptorOf(Directory directory) const {
    switch (directory) {
    case Directory::Music:
        return music_.get();
    case Directory::Own:
        return own_.get();
    case Directory::Top:
        break;
    }
    return root_.get();
}

bool PosixVolume::makeDirectory(Directory directory) {
    if (directory == Directory::Own) {
        return own_ ? std::exchange(isOwnNew_, false) : lockOwn();
    }
    const bool isNew = make(root_.get(), directory, isFat_);
    music_ = openDirectory(root_.get(), directory);
    return isNew;
}

void PosixVolume::removeDirectory(Directory directory) {
    if (unlinkat(root_.get(), nameOf(directory), AT_REMOVEDIR) != 0) {
        fail(nameOf(directory));
    }
    if (directory == Directory::Own) {
        own_ = FileDescriptor();
    }
}

std::vector<std::string> PosixVolume::names(Directory directory) {
    return namesIn(descriptorOf(directory));
}

std::optional<base::FileState> PosixVolume::find(Directory directory, const std::string& name) {
    base::FileStatus status{};
    if (fstatat(descriptorOf(directory), name.c_str(), &status, AT_SYMLINK_NOFOLLOW) != 0) {
        if (errno == ENOENT) {
            return std::nullopt;
        }
        fail(name);
    }
    return S_ISREG(status.st_mode) ? std::optional(base::stateOf(status)) : std::nullopt;
}

std::unique_ptr<base::Reader> PosixVolume::open(Directory directory, const std::string& name) {
    return std::make_unique<PosixReader>(openFile(descriptorOf(directory), name, O_RDONLY));
}

std::unique_ptr<VolumeFile> PosixVolume::create(Directory directory, const std::string& name) {
    constexpr mode_t forItsOwner = 0600;
    FileDescriptor file(openat(descriptorOf(directory), name.c_str(),
                               O_WRONLY | O_CREAT | O_EXCL | O_CLOEXEC, forItsOwner));
    if (!file) {
        fail(name);
    }
    return std::make_unique<PosixVolumeFile>(std::move(file), isFat_);
}

std::unique_ptr<VolumeFile> PosixVolume::overwrite(Directory directory, const std::string& name) {
    return std::make_unique<PosixVolumeFile>(openFile(descriptorOf(directory), name, O_WRONLY),
                                             isFat_);
}

void PosixVolume::rename(Directory directory, const std::string& name, const std::string& newName) {
    renameUnlessTaken(descriptorOf(directory), name.c_str(), newName.c_str());
}

void PosixVolume::remove(Directory directory, const std::string& name) {
    const int in = descriptorOf(directory);
    if (unlinkat(in, name.c_str(), 0) != 0) {
        fail(name);
    }
    if (isFat_) {
        // Only for the order; `syncDirectory` tells what went wrong.
        static_cast<void>(fsync(in));
    }
}

void PosixVolume::syncDirectory(Directory directory) {
    base::syncToDevice(descriptorOf(directory));
}

void PosixVolume::sync() { syncVolumeOf(root_.get()); }

std::uint64_t PosixVolume::available() { return wearable::availableBytes(wearable_, root_.get()); }

} // namespace quorl::syncd
