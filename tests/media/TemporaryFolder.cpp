#include "tests/media/TemporaryFolder.h"

#include <cerrno>
#include <cstdlib>
#include <ctime>
#include <fstream>
#include <stdexcept>
#include <system_error>
#include <thread>

#include <fcntl.h>
#include <sys/fsuid.h>
#include <sys/stat.h>
#include <unistd.h>

namespace quorl::media::test {

namespace {

constexpr uid_t nobody = 65534;

void check(int result) {
    if (result != 0) {
        throw std::system_error(errno, std::generic_category());
    }
}

} // namespace

TemporaryFolder::TemporaryFolder() {
    std::string name =
        std::filesystem::canonical(std::filesystem::temp_directory_path()) / "quorl-media-XXXXXX";
    if (mkdtemp(name.data()) == nullptr) {
        throw std::system_error(errno, std::generic_category());
    }
    path_ = name;
    setPermissions("", std::filesystem::perms(0755));
}

TemporaryFolder::~TemporaryFolder() {
    std::error_code ignored;
    std::filesystem::remove_all(path_, ignored);
}

void TemporaryFolder::write(std::string_view file, std::string_view bytes) const {
    std::filesystem::create_directories((path_ / file).parent_path());
    std::ofstream stream(path_ / file, std::ios::binary);
    stream.exceptions(std::ios::failbit | std::ios::badbit);
    stream << bytes << std::flush;
}

void TemporaryFolder::writeSongs(std::initializer_list<std::string> files, std::size_t size) const {
    for (const std::string& file : files) {
        write(file, std::string(size, '\0'));
    }
}

void TemporaryFolder::replace(std::string_view file, std::string_view bytes) const {
    const std::string beside = std::string(file) + ".new";
    write(beside, bytes);
    rename(beside, file);
}

void TemporaryFolder::makeDirectory(std::string_view directory) const {
    std::filesystem::create_directories(path_ / directory);
}

void TemporaryFolder::link(std::string_view link, const std::filesystem::path& target) const {
    std::filesystem::create_directories((path_ / link).parent_path());
    std::filesystem::create_symlink(target, path_ / link);
}

void TemporaryFolder::rename(std::string_view from, std::string_view to) const {
    std::filesystem::rename(path_ / from, path_ / to);
}

void TemporaryFolder::remove(std::string_view file) const {
    if (std::filesystem::remove_all(path_ / file) == 0) {
        throw std::runtime_error("There is no " + std::string(file) + " to remove.");
    }
}

void TemporaryFolder::setModified(std::string_view file, std::int64_t nanoseconds) const {
    constexpr std::int64_t second = 1'000'000'000;
    const timespec time{nanoseconds / second, nanoseconds % second};
    const timespec times[] = {time, time};
    check(utimensat(AT_FDCWD, (path_ / file).c_str(), times, 0));
}

void TemporaryFolder::setPermissions(std::string_view file,
                                     std::filesystem::perms permissions) const {
    std::filesystem::permissions(path_ / file, permissions);
}

WithoutPrivileges::WithoutPrivileges() : dropped_(geteuid() == 0) {
    if (dropped_) {
        setfsuid(nobody);
    }
}

WithoutPrivileges::~WithoutPrivileges() {
    if (dropped_) {
        setfsuid(0);
    }
}

void withPrivileges(const std::function<void()>& act) {
    // The rights are those of the thread.
    std::thread([&act] {
        setfsuid(geteuid());
        act();
    }).join();
}

const Playlist& playlistAt(const Inventory& inventory, std::string_view path) {
    for (const Playlist& playlist : inventory.playlists) {
        if (playlist.path == path) {
            return playlist;
        }
    }
    throw std::runtime_error("There is no playlist " + std::string(path) + ".");
}

std::vector<std::string> songsOf(const Inventory& inventory, std::string_view path) {
    std::vector<std::string> songs;
    for (const SongIndex song : playlistAt(inventory, path).songs) {
        songs.push_back(inventory.songs[song].path());
    }
    return songs;
}

std::vector<std::string> namesOf(const Inventory& inventory) {
    std::vector<std::string> names;
    for (const Playlist& playlist : inventory.playlists) {
        names.push_back(playlist.name);
    }
    return names;
}

std::vector<Reason> reasonsFor(const Inventory& inventory, std::string_view path) {
    std::vector<Reason> reasons;
    for (const LeftOut& leftOut : inventory.leftOut) {
        if (leftOut.playlist == path) {
            reasons.push_back(leftOut.reason);
        }
    }
    return reasons;
}

} // namespace quorl::media::test
