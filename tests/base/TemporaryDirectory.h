#pragma once

#include <cstdint>
#include <filesystem>
#include <initializer_list>
#include <string>
#include <string_view>

namespace quorl::tests {

/// A new directory that is deleted with all in it. Paths are relative to it. Every failure to do
/// what is asked throws, which fails the test.
class TemporaryDirectory {
  public:
    TemporaryDirectory();
    ~TemporaryDirectory();

    TemporaryDirectory(const TemporaryDirectory&) = delete;
    TemporaryDirectory& operator=(const TemporaryDirectory&) = delete;

    /// Without symbolic links.
    [[nodiscard]] const std::filesystem::path& path() const { return path_; }

    [[nodiscard]] std::filesystem::path operator/(std::string_view relative) const {
        return path_ / relative;
    }

    /// Writes a file in place, with the directories that it needs.
    void write(std::string_view file, std::string_view bytes) const;

    /// Writes files of `size` bytes each.
    void writeSongs(std::initializer_list<std::string> files, std::size_t size = 3) const;

    /// Writes a file beside `file` and renames it to that, as careful programs save.
    void replace(std::string_view file, std::string_view bytes) const;

    void makeDirectory(std::string_view directory) const;
    void link(std::string_view link, const std::filesystem::path& target) const;
    void rename(std::string_view from, std::string_view to) const;
    void remove(std::string_view file) const;
    void setModified(std::string_view file, std::int64_t nanoseconds) const;
    void setPermissions(std::string_view file, std::filesystem::perms permissions) const;

  private:
    std::filesystem::path path_;
};

} // namespace quorl::tests
