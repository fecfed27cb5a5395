#include "quorl-syncd/transfer/SongSource.h"

#include <algorithm>
#include <cerrno>
#include <cstring>
#include <memory>
#include <system_error>
#include <vector>

#include <fcntl.h>
#include <linux/fs.h>
#include <sys/ioctl.h>
#include <unistd.h>

#include "quorl-syncd/transfer/ContentHash.h"
#include "quorl-syncd/transfer/RateLimit.h"
#include "services/base/Utf8.h"

namespace quorl::syncd {

namespace {

constexpr std::size_t pieceSize = 1 << 20;
constexpr std::uint64_t mostHeldBack = 16 << 20;
constexpr std::int64_t nanosecondsPerSecond = 1'000'000'000;

[[noreturn]] void fail(const char* what) {
    throw std::system_error{errno, std::generic_category(), what};
}

std::size_t readSome(int file, std::span<std::byte> buffer) {
    for (;;) {
        const auto size = read(file, buffer.data(), buffer.size());
        if (size >= 0) {
            return static_cast<std::size_t>(size);
        }
        if (errno != EINTR) {
            fail("read");
        }
    }
}

void stopIf(const std::stop_token& stop) {
    if (stop.stop_requested()) {
        throw Stopped{};
    }
}

/// Has the system begin to write the file from `start` on, so that little is left to wait for at
/// the end, and progress is not far ahead of the device.
void startWriting(int file, std::uint64_t start) {
    static_cast<void>(sync_file_range(file, static_cast<off_t>(start), 0, SYNC_FILE_RANGE_WRITE));
}

void setModified(int file, std::int64_t modified) {
    auto seconds = modified / nanosecondsPerSecond;
    auto rest = modified % nanosecondsPerSecond;
    if (rest < 0) {
        rest += nanosecondsPerSecond;
        --seconds;
    }
    const timespec time{static_cast<time_t>(seconds), static_cast<long>(rest)};
    const timespec times[]{time, time};
    // Some devices keep no times; the copy is none the worse.
    static_cast<void>(futimens(file, times));
}

std::string inQuotes(const std::string& path) { return "“" + base::printable(path) + "”"; }

} // namespace

FileState stateOf(const struct stat& status) {
    return {static_cast<std::uint64_t>(status.st_size),
            static_cast<std::int64_t>(status.st_mtim.tv_sec) * nanosecondsPerSecond +
                status.st_mtim.tv_nsec};
}

FileState stateOf(int file) {
    struct stat status {};

    if (fstat(file, &status) != 0) {
        fail("fstat");
    }
    return stateOf(status);
}

void writeAll(int file, std::span<const std::byte> bytes) {
    while (!bytes.empty()) {
        const auto written = write(file, bytes.data(), bytes.size());
        if (written < 0 && errno != EINTR) {
            fail("write");
        }
        bytes = bytes.subspan(written > 0 ? static_cast<std::size_t>(written) : 0);
    }
}

std::string hashOf(int file, const std::stop_token& stop) {
    ContentHash hash;
    std::vector<std::byte> buffer(pieceSize);
    for (;;) {
        stopIf(stop);
        const auto size = readSome(file, buffer);
        if (size == 0) {
            return hash.text();
        }
        hash.add(std::span{buffer}.first(size));
    }
}

SongSource::SongSource(const std::filesystem::path& root, const std::string& path,
                       FileState expected)
    : path_{path},
      expected_{expected},
      file_{open((root / path).c_str(), O_RDONLY | O_NOFOLLOW | O_NONBLOCK | O_CLOEXEC)} {
    if (!file_) {
        throw SongProblem{errno == ENOENT
                              ? inQuotes(path_) + " is no longer in the music folder."
                              : inQuotes(path_) + " cannot be read: " + std::strerror(errno) + "."};
    }
    requireUnchanged();
    static_cast<void>(posix_fadvise(file_.get(), 0, 0, POSIX_FADV_SEQUENTIAL));
}

std::string SongSource::hash(const std::stop_token& stop) const {
    try {
        return hashOf(file_.get(), stop);
    } catch (const std::system_error& error) {
        throw SongProblem{inQuotes(path_) + " cannot be read: " + error.code().message() + "."};
    }
}

std::string SongSource::copyTo(int destination, RateLimit& rate,
                               const std::function<void(std::uint64_t)>& moved,
                               const std::stop_token& stop) const {
    auto hash = copyPieces(destination, rate, moved, stop);
    requireUnchanged();
    setModified(destination, expected_.modified);
    return hash;
}

std::string SongSource::copyPieces(int destination, RateLimit& rate,
                                   const std::function<void(std::uint64_t)>& moved,
                                   const std::stop_token& stop) const {
    // Where both are on one file system that can share blocks, nothing has to be copied at all. The
    // contents are read for the hash in any case, so a copy within the kernel would be a second
    // one.
    const bool isShared = ioctl(destination, FICLONE, file_.get()) == 0;
    ContentHash hash;
    std::vector<std::byte> buffer(pieceSize);
    for (std::uint64_t copied = 0, started = 0;;) {
        stopIf(stop);
        const auto piece = readPiece(std::span{buffer}.first(std::min(rate.chunk(), pieceSize)));
        if (piece.empty() || copied - started >= mostHeldBack) {
            startWriting(destination, started);
            started = copied;
        }
        if (piece.empty()) {
            return hash.text();
        }
        hash.add(piece);
        if (!isShared) {
            writeAll(destination, piece);
        }
        copied += piece.size();
        if (copied > expected_.size) {
            requireUnchanged();
        }
        rate.pace(piece.size(), stop);
        moved(piece.size());
    }
}

std::span<std::byte> SongSource::readPiece(std::span<std::byte> buffer) const {
    try {
        return buffer.first(readSome(file_.get(), buffer));
    } catch (const std::system_error& error) {
        throw SongProblem{inQuotes(path_) + " cannot be read: " + error.code().message() + "."};
    }
}

void SongSource::requireUnchanged() const {
    struct stat status {};

    if (fstat(file_.get(), &status) != 0 || !S_ISREG(status.st_mode)) {
        throw SongProblem{inQuotes(path_) + " is not a file any more."};
    }
    if (stateOf(status) != expected_) {
        throw SongProblem{inQuotes(path_) +
                          " has just been changed. It will be sent once it stays as it is."};
    }
}

} // namespace quorl::syncd
