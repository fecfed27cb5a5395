#include "services/base/MountWatch.h"

#include <sstream>
#include <string_view>
#include <system_error>
#include <utility>

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include "services/base/FileContents.h"
#include "services/base/FileStatus.h"
#include "services/base/Paths.h"

namespace quorl::base {

namespace {

/// Empty where it cannot be read, which counts as a change.
std::string textOf(const FileDescriptor& table) {
    try {
        lseek(table.get(), 0, SEEK_SET);
        return readAll(table.get());
    } catch (const std::system_error&) {
        return {};
    }
}

/// A field of the mount table, in which blanks and backslashes are written as three octal digits.
std::string unescaped(std::string_view field) {
    std::string text;
    while (!field.empty()) {
        if (field.front() == '\\' && field.size() >= 4) {
            const int code = (field[1] - '0') * 64 + (field[2] - '0') * 8 + (field[3] - '0');
            text += static_cast<char>(code);
            field.remove_prefix(4);
        } else {
            text += field.front();
            field.remove_prefix(1);
        }
    }
    return text;
}

} // namespace

MountWatch::MountWatch(std::filesystem::path root)
    : root_(std::move(root)),
      table_(open("/proc/self/mountinfo", O_RDONLY | O_CLOEXEC)),
      known_(describe()) {}

bool MountWatch::take() {
    std::string now = describe();
    const bool changed = now != known_;
    known_ = std::move(now);
    return changed;
}

std::string MountWatch::describe() const {
    FileStatus status{};
    if (stat(root_.c_str(), &status) != 0) {
        return {};
    }
    std::ostringstream description;
    description << status.st_dev << ' ' << status.st_ino << '\n';
    std::error_code error;
    std::string canonical = std::filesystem::canonical(root_, error).string();
    canonical = canonical == "/" ? "" : canonical;
    std::istringstream table(textOf(table_));
    for (std::string line; std::getline(table, line);) {
        std::istringstream fields(line);
        std::string id, parent, device, rootInDevice, mountPoint;
        fields >> id >> parent >> device >> rootInDevice >> mountPoint;
        if (isWithin(unescaped(mountPoint), canonical)) {
            description << id << ' ' << device << ' ' << mountPoint << '\n';
        }
    }
    return description.str();
}

} // namespace quorl::base
