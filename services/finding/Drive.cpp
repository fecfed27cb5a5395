#include "services/finding/Drive.h"

#include <algorithm>
#include <iterator>

namespace quorl::finding {

namespace {

const Drive* driveWith(std::string Drive::*member, const std::string& value,
                       const std::vector<Drive>& drives) {
    const auto found = std::ranges::find(drives, value, member);
    return found == drives.end() ? nullptr : &*found;
}

} // namespace

/// Some file systems show a number that no device has; what was mounted is a node still.
const Drive* driveOf(const base::Mount& mount, const std::vector<Drive>& drives) {
    const auto* const drive = driveWith(&Drive::device, mount.device, drives);
    return drive != nullptr ? drive : driveWith(&Drive::node, mount.source, drives);
}

std::vector<Drive> joined(std::vector<Drive> told, const std::vector<Drive>& seen) {
    std::vector<Drive> unknown;
    std::ranges::copy_if(seen, std::back_inserter(unknown), [&told](const Drive& drive) {
        return driveWith(&Drive::device, drive.device, told) == nullptr;
    });
    std::ranges::move(unknown, std::back_inserter(told));
    return told;
}

} // namespace quorl::finding
