#include "services/wearable/Wearable.h"

#include <cstdlib>
#include <string_view>

#include <fcntl.h>
#include <sys/stat.h>

namespace quorl::wearable {

namespace {

std::filesystem::path dataDirectory() {
    const char* const given = std::getenv("XDG_DATA_HOME");
    if (given != nullptr && std::string_view{given}.starts_with('/')) {
        return given;
    }
    const char* const home = std::getenv("HOME");
    return std::filesystem::path{home == nullptr ? "/" : home} / ".local/share";
}

} // namespace

Wearable Wearable::embedded(base::Purpose purpose, std::uint64_t capacity) {
    const auto* const name = purpose == base::Purpose::Trial ? "trial-wearable" : "wearable";
    return {dataDirectory() / "quorl" / name, capacity, false};
}

bool isMountPoint(const std::filesystem::path& directory) {
    struct statx status {};

    return statx(AT_FDCWD, directory.c_str(), 0, 0, &status) == 0 &&
           (status.stx_attributes & STATX_ATTR_MOUNT_ROOT) != 0;
}

} // namespace quorl::wearable
