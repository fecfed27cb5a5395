#include "services/base/AtomicFile.h"

#include <cerrno>
#include <cstdio>
#include <system_error>

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include "services/base/FileContents.h"

namespace quorl::base {

namespace {

constexpr mode_t forItsOwner = 0700;

[[noreturn]] void fail(const std::string& what) {
    throw std::system_error(errno, std::generic_category(), what);
}

} // namespace

FileDescriptor openDirectory(int parent, const char* name) {
    if (mkdirat(parent, name, forItsOwner) != 0 && errno != EEXIST) {
        fail(name);
    }
    FileDescriptor directory(openat(parent, name, O_RDONLY | O_DIRECTORY | O_NOFOLLOW | O_CLOEXEC));
    if (!directory) {
        fail(name);
    }
    return directory;
}

void makeDirectories(const std::filesystem::path& path) {
    std::filesystem::path directory = path.root_path();
    for (const auto& name : path.relative_path()) {
        directory /= name;
        const int error = mkdir(directory.c_str(), forItsOwner) == 0 ? 0 : errno;
        if (error != 0 && !std::filesystem::is_directory(directory)) {
            throw std::system_error(error, std::generic_category(), directory);
        }
    }
}

FileDescriptor openRoot(const char* path) {
    FileDescriptor directory(open(path, O_RDONLY | O_DIRECTORY | O_CLOEXEC));
    if (!directory) {
        fail(path);
    }
    return directory;
}

void syncToDevice(int descriptor) {
    if (fsync(descriptor) != 0 && errno != EINVAL && errno != ENOTSUP) {
        fail("fsync");
    }
}

void replaceFile(int directory, const std::string& name, std::string_view text) {
    const auto temporary = "." + name + ".new";
    constexpr mode_t forItsOwnerToWrite = 0600;
    // What is left of an earlier try may be anything by now, even a pipe that would be waited for.
    if (unlinkat(directory, temporary.c_str(), 0) != 0 && errno != ENOENT) {
        fail(name);
    }
    const FileDescriptor file(openat(directory, temporary.c_str(),
                                     O_WRONLY | O_CREAT | O_EXCL | O_CLOEXEC, forItsOwnerToWrite));
    if (!file) {
        fail(name);
    }
    writeAll(file.get(), std::as_bytes(std::span(text)));
    syncToDevice(file.get());
    if (renameat(directory, temporary.c_str(), directory, name.c_str()) != 0) {
        fail(name);
    }
    syncToDevice(directory);
}

std::string readFile(int directory, const std::string& name, std::size_t most) {
    const FileDescriptor file(
        openat(directory, name.c_str(), O_RDONLY | O_NOFOLLOW | O_NONBLOCK | O_CLOEXEC));
    if (!file) {
        if (errno == ENOENT) {
            return {};
        }
        fail(name);
    }
    return readAll(file.get(), most);
}

} // namespace quorl::base
