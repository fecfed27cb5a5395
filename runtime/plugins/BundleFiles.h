#pragma once

#include <cstddef>
#include <filesystem>
#include <map>
#include <string>

namespace quorl {

/// The SHA-256 of the files of a bundle in lower-case hexadecimal digits, by their paths in it.
using Digests = std::map<std::string, std::string>;

/// The SHA-256 of `bytes` in lower-case hexadecimal digits.
[[nodiscard]] std::string sha256(const std::string& bytes);

/// The bytes of a file of a bundle. Throws `BundleError` where it is missing, cannot be read, is no
/// regular file or has more than `maximumBytes`. Never waits on a pipe or a device.
[[nodiscard]] std::string readBundleFile(const std::filesystem::path& file,
                                         std::size_t maximumBytes);

/// Gives the files of a bundle as long as they are what they were when it was made. The loader and
/// the reader of string tables trust what they read, so that a damaged file would end the process.
class BundleFiles {
  public:
    BundleFiles(std::filesystem::path directory, Digests digests)
        : directory_(std::move(directory)), digests_(std::move(digests)) {}

    /// The path of the file `name`.
    [[nodiscard]] std::filesystem::path path(const std::string& name) const {
        return directory_ / name;
    }

    /// Whether there is, or was when the bundle was made, a file of this name.
    [[nodiscard]] bool has(const std::string& name) const;

    /// The bytes of the file `name`. Throws `BundleError` as `readBundleFile` does, and where they
    /// are not those that its digest was taken of.
    [[nodiscard]] std::string read(const std::string& name) const;

  private:
    std::filesystem::path directory_;
    Digests digests_;
};

} // namespace quorl
