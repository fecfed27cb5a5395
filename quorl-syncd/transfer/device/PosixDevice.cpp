#include "quorl-syncd/transfer/device/PosixDevice.h"

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

constexpr std::uint64_t mostHeldBack = 16 << 20;

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

std::string partOf(const std::string& name) { return name + ".part"; }

bool isPart(const std::string& file) { return file.ends_with(partOf({})); }

class PosixReader final : public Reader {
  public:
    explicit PosixReader(FileDescriptor file) : file_(std::move(file)) {}

    [[nodiscard]] std::size_t read(std::span<std::byte> buffer) override {
        return base::readSome(file_.get(), buffer);
    }

  private:
    FileDescriptor file_;
};

class PosixUnfinishedFile final : public UnfinishedFile {
  public:
    explicit PosixUnfinishedFile(FileDescriptor file) : file_(std::move(file)) {}

    [[nodiscard]] bool share(int descriptor) override {
        return descriptor >= 0 && ioctl(file_.get(), FICLONE, descriptor) == 0;
    }

    void write(std::span<const std::byte> bytes) override {
        base::writeAll(file_.get(), bytes);
        written_ += bytes.size();
        if (written_ - begun_ >= mostHeldBack) {
            beginWriting();
        }
    }

    void complete(std::int64_t modified) override {
        beginWriting();
        const auto time = base::timeOf(modified);
        const timespec times[]{time, time};
        // Some devices keep no times; the copy is none the worse.
        static_cast<void>(futimens(file_.get(), times));
    }

    void sync() override { base::syncToDevice(file_.get()); }

  private:
    /// So that little is left to wait for at the end, and progress is not far ahead of the device.
    void beginWriting() {
        static_cast<void>(
            sync_file_range(file_.get(), static_cast<off_t>(begun_), 0, SYNC_FILE_RANGE_WRITE));
        begun_ = written_;
    }

    FileDescriptor file_;
    std::uint64_t written_ = 0;
    std::uint64_t begun_ = 0;
};

} // namespace

PosixDevice::PosixDevice(const wearable::Wearable& wearable)
    : wearable_(wearable),
      root_(openWearable(wearable)),
      music_(base::openDirectory(root_.get(), wearable::musicDirectory)),
      own_(base::openDirectory(root_.get(), wearable::ownDirectory)) {
    if (flock(own_.get(), LOCK_EX | LOCK_NB) != 0 && errno == EWOULDBLOCK) {
        throw std::runtime_error(anotherProgramIsSyncing());
    }
}

wearable::Manifest PosixDevice::loadManifest() { return wearable::loadManifest(root_.get()); }

void PosixDevice::saveManifest(const wearable::Manifest& manifest) {
    wearable::saveManifest(root_.get(), manifest);
}

std::uint64_t PosixDevice::available() { return wearable::availableBytes(wearable_, root_.get()); }

std::vector<std::string> PosixDevice::musicNames() { return namesIn(music_.get()); }

std::optional<base::FileState> PosixDevice::find(const std::string& name) {
    base::FileStatus status{};
    if (fstatat(music_.get(), name.c_str(), &status, AT_SYMLINK_NOFOLLOW) != 0) {
        if (errno == ENOENT) {
            return std::nullopt;
        }
        fail(name);
    }
    return S_ISREG(status.st_mode) ? std::optional(base::stateOf(status)) : std::nullopt;
}

std::unique_ptr<Reader> PosixDevice::openMusic(const std::string& name) {
    FileDescriptor file(
        openat(music_.get(), name.c_str(), O_RDONLY | O_NOFOLLOW | O_NONBLOCK | O_CLOEXEC));
    if (!file) {
        fail(name);
    }
    return std::make_unique<PosixReader>(std::move(file));
}

void PosixDevice::removeMusic(const std::string& name) {
    if (unlinkat(music_.get(), name.c_str(), 0) != 0 && errno != ENOENT) {
        fail(name);
    }
}

std::unique_ptr<UnfinishedFile> PosixDevice::createUnfinished(const std::string& name) {
    constexpr mode_t forEverybodyToRead = 0644;
    FileDescriptor file(openat(own_.get(), partOf(name).c_str(),
                               O_WRONLY | O_CREAT | O_TRUNC | O_NOFOLLOW | O_CLOEXEC,
                               forEverybodyToRead));
    if (!file) {
        fail(name);
    }
    return std::make_unique<PosixUnfinishedFile>(std::move(file));
}

void PosixDevice::finish(const std::string& unfinished, const std::string& name, IfThere ifThere) {
    const auto from = partOf(unfinished);
    if (ifThere == IfThere::Fail) {
        if (renameat2(own_.get(), from.c_str(), music_.get(), name.c_str(), RENAME_NOREPLACE) ==
            0) {
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
    }
    if (renameat(own_.get(), from.c_str(), music_.get(), name.c_str()) != 0) {
        fail(name);
    }
}

void PosixDevice::removeUnfinished() {
    for (const auto& name : namesIn(own_.get())) {
        if (isPart(name) && unlinkat(own_.get(), name.c_str(), 0) != 0) {
            fail(name);
        }
    }
}

void PosixDevice::syncMusic() { base::syncToDevice(music_.get()); }

} // namespace quorl::syncd
