#include "services/base/MountWatch.h"

#include <array>
#include <cstddef>
#include <sstream>
#include <string_view>
#include <system_error>
#include <utility>

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include "services/base/FileStatus.h"
#include "services/base/Paths.h"

namespace quorl::base {

namespace {

std::string readFromStart(int file) {
    std::string text;
    std::array<char, 16384>
        buffer; // NOLINT(cppcoreguidelines-pro-type-member-init): read() fills it
    lseek(file, 0, SEEK_SET);
    for (ssize_t size = 0; (size = read(file, buffer.data(), buffer.size())) > 0;) {
        text.append(buffer.data(), static_cast<std::size_t>(size));
    }
    return text;
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
    std::istringstream table(readFromStart(table_.get()));
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
