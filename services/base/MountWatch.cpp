#include "services/base/MountWatch.h"

#include <sstream>
#include <system_error>
#include <utility>

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include "services/base/FileContents.h"
#include "services/base/FileStatus.h"
#include "services/base/MountTable.h"
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
    for (const auto& mount : mountsIn(textOf(table_))) {
        if (isWithin(mount.directory.native(), canonical)) {
            description << mount.id << ' ' << mount.device << ' ' << mount.directory << '\n';
        }
    }
    return description.str();
}

} // namespace quorl::base
