#include "tests/base/TemporaryDirectory.h"

#include <cerrno>
#include <cstdlib>
#include <ctime>
#include <fstream>
#include <stdexcept>
#include <system_error>

#include <fcntl.h>
#include <sys/stat.h>

namespace quorl::tests {

namespace {

void check(int result) {
    if (result != 0) {
        throw std::system_error(errno, std::generic_category());
    }
}

} // namespace

TemporaryDirectory::TemporaryDirectory() {
    std::string name =
        std::filesystem::canonical(std::filesystem::temp_directory_path()) / "quorl-test-XXXXXX";
    if (mkdtemp(name.data()) == nullptr) {
        throw std::system_error(errno, std::generic_category());
    }
    path_ = name;
    setPermissions("", std::filesystem::perms(0755));
}

TemporaryDirectory::~TemporaryDirectory() {
    std::error_code ignored;
    std::filesystem::remove_all(path_, ignored);
}

void TemporaryDirectory::write(std::string_view file, std::string_view bytes) const {
    std::filesystem::create_directories((path_ / file).parent_path());
    std::ofstream stream(path_ / file, std::ios::binary);
    stream.exceptions(std::ios::failbit | std::ios::badbit);
    stream << bytes << std::flush;
}

void TemporaryDirectory::writeSongs(std::initializer_list<std::string> files,
                                    std::size_t size) const {
    for (const std::string& file : files) {
        write(file, std::string(size, '\0'));
    }
}

void TemporaryDirectory::replace(std::string_view file, std::string_view bytes) const {
    const std::string beside = std::string(file) + ".new";
    write(beside, bytes);
    rename(beside, file);
}

void TemporaryDirectory::makeDirectory(std::string_view directory) const {
    std::filesystem::create_directories(path_ / directory);
}

void TemporaryDirectory::link(std::string_view link, const std::filesystem::path& target) const {
    std::filesystem::create_directories((path_ / link).parent_path());
    std::filesystem::create_symlink(target, path_ / link);
}

void TemporaryDirectory::rename(std::string_view from, std::string_view to) const {
    std::filesystem::rename(path_ / from, path_ / to);
}

void TemporaryDirectory::remove(std::string_view file) const {
    if (std::filesystem::remove_all(path_ / file) == 0) {
        throw std::runtime_error("There is no " + std::string(file) + " to remove.");
    }
}

void TemporaryDirectory::setModified(std::string_view file, std::int64_t nanoseconds) const {
    constexpr std::int64_t second = 1'000'000'000;
    using Rest = decltype(timespec::tv_nsec); // of 32 bits on some machines
    const timespec time{nanoseconds / second, static_cast<Rest>(nanoseconds % second)};
    const timespec times[] = {time, time};
    check(utimensat(AT_FDCWD, (path_ / file).c_str(), times, 0));
}

void TemporaryDirectory::setPermissions(std::string_view file,
                                        std::filesystem::perms permissions) const {
    std::filesystem::permissions(path_ / file, permissions);
}

} // namespace quorl::tests
