#pragma once

#include <cstdint>
#include <filesystem>
#include <functional>
#include <initializer_list>
#include <string>
#include <string_view>
#include <vector>

#include "services/media/Inventory.h"

namespace quorl::media::test {

/// A new directory that is deleted with all in it. Paths are relative to it. Every failure to do
/// what is asked throws, which fails the test.
class TemporaryFolder {
  public:
    TemporaryFolder();
    ~TemporaryFolder();

    TemporaryFolder(const TemporaryFolder&) = delete;
    TemporaryFolder& operator=(const TemporaryFolder&) = delete;

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

/// While one is there, this thread and those that it starts have no more rights in the file system
/// than any user, also when the tests are run by root.
class WithoutPrivileges {
  public:
    WithoutPrivileges();
    ~WithoutPrivileges();

    WithoutPrivileges(const WithoutPrivileges&) = delete;
    WithoutPrivileges& operator=(const WithoutPrivileges&) = delete;

  private:
    bool dropped_;
};

/// Does `act` with the rights that the process has, also where there are `WithoutPrivileges`.
void withPrivileges(const std::function<void()>& act);

/// The playlist, or folder, of this path; throws where there is none.
[[nodiscard]] const Playlist& playlistAt(const Inventory& inventory, std::string_view path);

/// The paths of the songs in the playlist of this path.
[[nodiscard]] std::vector<std::string> songsOf(const Inventory& inventory, std::string_view path);

/// The names of all playlists, in order.
[[nodiscard]] std::vector<std::string> namesOf(const Inventory& inventory);

/// The reasons for which entries of the playlist of this path are left out, in order.
[[nodiscard]] std::vector<Reason> reasonsFor(const Inventory& inventory, std::string_view path);

} // namespace quorl::media::test
