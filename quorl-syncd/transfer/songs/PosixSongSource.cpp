#include "quorl-syncd/transfer/songs/PosixSongSource.h"

#include <cerrno>
#include <cstring>
#include <system_error>
#include <utility>

#include <fcntl.h>

#include "services/base/FileContents.h"
#include "services/base/FileDescriptor.h"
#include "services/base/Paths.h"

namespace quorl::syncd {

namespace {

base::FileDescriptor openFile(const std::filesystem::path& file) {
    return base::FileDescriptor(
        ::open(file.c_str(), O_RDONLY | O_NOFOLLOW | O_NONBLOCK | O_CLOEXEC));
}

/// A link in the folder stands for the file that it leads to, as long as that is in the folder too.
base::FileDescriptor openSong(const std::filesystem::path& root, const std::string& path) {
    auto file = openFile(root / path);
    if (file || errno != ELOOP) {
        return file;
    }
    std::error_code error;
    const auto target = std::filesystem::canonical(root / path, error);
    const auto folder = error ? std::filesystem::path() : std::filesystem::canonical(root, error);
    const bool isInside = !error && base::isWithin(target.native(), folder.native());
    errno = error ? error.value() : ELOOP;
    return isInside ? openFile(target) : base::FileDescriptor();
}

class PosixSong final : public OpenSong {
  public:
    PosixSong(const std::filesystem::path& root, std::string path, const base::FileState& expected)
        : path_(std::move(path)), expected_(expected), file_(openSong(root, path_)) {
        if (!file_) {
            throw SongProblem(errno == ENOENT ? SongTrouble::Gone : SongTrouble::Unreadable, path_,
                              std::strerror(errno));
        }
        PosixSong::requireUnchanged();
        static_cast<void>(posix_fadvise(file_.get(), 0, 0, POSIX_FADV_SEQUENTIAL));
    }

    [[nodiscard]] std::size_t read(std::span<std::byte> buffer) override {
        try {
            return base::readSome(file_.get(), buffer);
        } catch (const std::system_error& error) {
            throw SongProblem(SongTrouble::Unreadable, path_, error.code().message());
        }
    }

    void requireUnchanged() const override {
        base::FileStatus status{};
        if (fstat(file_.get(), &status) != 0 || !S_ISREG(status.st_mode)) {
            throw SongProblem(SongTrouble::NotAFile, path_);
        }
        if (base::stateOf(status) != expected_) {
            throw SongProblem(SongTrouble::Changed, path_);
        }
    }

    [[nodiscard]] int descriptor() const override { return file_.get(); }

  private:
    std::string path_;
    base::FileState expected_;
    base::FileDescriptor file_;
};

} // namespace

std::unique_ptr<OpenSong> PosixSongSource::open(const std::filesystem::path& root,
                                                const std::string& path,
                                                const base::FileState& expected) {
    return std::make_unique<PosixSong>(root, path, expected);
}

} // namespace quorl::syncd
