#pragma once

#include <cstddef>
#include <cstdint>
#include <filesystem>
#include <functional>
#include <span>
#include <stdexcept>
#include <stop_token>
#include <string>

#include <sys/stat.h>

#include "services/base/FileDescriptor.h"

/// Reading and copying files in pieces.
namespace quorl::syncd {

class RateLimit;

/// What tells one state of a file from another.
struct FileState {
    /// In bytes.
    std::uint64_t size = 0;
    /// Nanoseconds since 1970.
    std::int64_t modified = 0;

    bool operator==(const FileState&) const = default;
};

[[nodiscard]] FileState stateOf(const struct stat& status);

/// Of an open file. Throws `std::system_error`.
[[nodiscard]] FileState stateOf(int file);

/// The sync is to end.
struct Stopped {};

/// The hash of an open file's contents, from its beginning. Throws `std::system_error`, and
/// `Stopped` soon after `stop` was requested.
[[nodiscard]] std::string hashOf(int file, const std::stop_token& stop);

/// A song of the music folder cannot be sent as it is; the others can. The text is a sentence for
/// the user.
class SongProblem : public std::runtime_error {
  public:
    using std::runtime_error::runtime_error;
};

/// A song of the music folder, open for reading.
class SongSource {
  public:
    /// Opens the song at `path` in the music folder `root`. Throws `SongProblem` where it is gone,
    /// cannot be read, or is not in the state that is expected.
    SongSource(const std::filesystem::path& root, const std::string& path, FileState expected);

    /// Throws `SongProblem`, and `Stopped` soon after `stop` was requested.
    [[nodiscard]] std::string hash(const std::stop_token& stop) const;

    /// Copies the contents to the open empty file, and its modification time; gives back the hash
    /// of the contents. What is copied is on its way to the device then, but need not be there.
    ///
    /// `moved` is called with the number of bytes after each piece. Throws `SongProblem` where the
    /// song cannot be read or changes meanwhile, `std::system_error` where the copy cannot be
    /// written, and `Stopped` soon after `stop` was requested.
    [[nodiscard]] std::string copyTo(int destination, RateLimit& rate,
                                     const std::function<void(std::uint64_t)>& moved,
                                     const std::stop_token& stop) const;

  private:
    [[nodiscard]] std::string copyPieces(int destination, RateLimit& rate,
                                         const std::function<void(std::uint64_t)>& moved,
                                         const std::stop_token& stop) const;
    std::span<std::byte> readPiece(std::span<std::byte> buffer) const;
    void requireUnchanged() const;

    std::string path_;
    FileState expected_;
    base::FileDescriptor file_;
};

/// Throws `std::system_error`.
void writeAll(int file, std::span<const std::byte> bytes);

} // namespace quorl::syncd
