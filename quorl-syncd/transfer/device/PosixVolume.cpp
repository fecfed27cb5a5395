#include "quorl-syncd/transfer/device/PosixVolume.h"

#include <cerrno>
#include <cstdio>
#include <system_error>
#include <utility>

#include <dirent.h>
#include <fcntl.h>
#include <linux/fs.h>
#include <sys/file.h>
#include <sys/ioctl.h>
#include <sys/stat.h>
#include <unistd.h>

#include "quorl-syncd/transfer/Sentences.h"
#include "services/base/AtomicFile.h"
#include "services/base/FileContents.h"
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

class PosixReader final : public Reader {
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
    explicit PosixVolumeFile(FileDescriptor file) : file_(std::move(file)) {}

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

    void sync() override { base::syncToDevice(file_.get()); }

  private:
    FileDescriptor file_;
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

/// False: it is there already.
bool make(int root, Volume::Directory directory) {
    constexpr mode_t forEverybodyToRead = 0755;
    constexpr mode_t forItsOwner = 0700;
    const bool isOwn = directory == Volume::Directory::Own;
    if (mkdirat(root, nameOf(directory), isOwn ? forItsOwner : forEverybodyToRead) == 0) {
        return true;
    }
    if (errno != EEXIST) {
        fail(nameOf(directory));
    }
    return false;
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
      isOwnNew_(make(root_.get(), Directory::Own)) {
    own_ = openDirectory(root_.get(), Directory::Own);
    if (flock(own_.get(), LOCK_EX | LOCK_NB) != 0 && errno == EWOULDBLOCK) {
        throw std::runtime_error(anotherProgramIsSyncing());
    }
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
        return std::exchange(isOwnNew_, false);
    }
    const bool isNew = make(root_.get(), directory);
    music_ = openDirectory(root_.get(), directory);
    return isNew;
}

void PosixVolume::removeDirectory(Directory directory) {
    if (unlinkat(root_.get(), nameOf(directory), AT_REMOVEDIR) != 0) {
        fail(nameOf(directory));
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

std::unique_ptr<Reader> PosixVolume::open(Directory directory, const std::string& name) {
    return std::make_unique<PosixReader>(openFile(descriptorOf(directory), name, O_RDONLY));
}

std::unique_ptr<VolumeFile> PosixVolume::create(Directory directory, const std::string& name) {
    constexpr mode_t forItsOwner = 0600;
    FileDescriptor file(openat(descriptorOf(directory), name.c_str(),
                               O_WRONLY | O_CREAT | O_EXCL | O_CLOEXEC, forItsOwner));
    if (!file) {
        fail(name);
    }
    return std::make_unique<PosixVolumeFile>(std::move(file));
}

std::unique_ptr<VolumeFile> PosixVolume::overwrite(Directory directory, const std::string& name) {
    auto file = openFile(descriptorOf(directory), name, O_WRONLY);
    if (ftruncate(file.get(), 0) != 0) {
        fail(name);
    }
    return std::make_unique<PosixVolumeFile>(std::move(file));
}

void PosixVolume::rename(Directory directory, const std::string& name, const std::string& newName) {
    const int in = descriptorOf(directory);
    if (renameat2(in, name.c_str(), in, newName.c_str(), RENAME_NOREPLACE) == 0) {
        return;
    }
    if (errno != EINVAL && errno != ENOSYS) {
        fail(newName);
    }
    // A file system that cannot rename without replacing.
    if (faccessat(in, newName.c_str(), F_OK, AT_SYMLINK_NOFOLLOW) == 0) {
        errno = EEXIST;
        fail(newName);
    }
    if (renameat(in, name.c_str(), in, newName.c_str()) != 0) {
        fail(newName);
    }
}

void PosixVolume::remove(Directory directory, const std::string& name) {
    if (unlinkat(descriptorOf(directory), name.c_str(), 0) != 0) {
        fail(name);
    }
}

void PosixVolume::syncDirectory(Directory directory) {
    base::syncToDevice(descriptorOf(directory));
}

void PosixVolume::sync() {
    if (syncfs(root_.get()) != 0) {
        fail("syncfs");
    }
}

std::uint64_t PosixVolume::available() { return wearable::availableBytes(wearable_, root_.get()); }

} // namespace quorl::syncd
