#include "services/finding/SystemFiles.h"

#include <algorithm>
#include <array>
#include <cctype>
#include <fstream>
#include <iterator>
#include <map>
#include <string_view>
#include <system_error>

namespace quorl::finding {

namespace {

namespace fs = std::filesystem;

std::string lineOf(const fs::path& file) {
    std::string line;
    std::ifstream stream(file);
    std::getline(stream, line);
    return line;
}

/// What udev writes as "\x20" in the name of a link.
std::string unescaped(std::string_view name) {
    std::string text;
    while (!name.empty()) {
        const bool isEscape = name.size() >= 4 && name.starts_with("\\x") &&
                              std::isxdigit(static_cast<unsigned char>(name[2])) != 0 &&
                              std::isxdigit(static_cast<unsigned char>(name[3])) != 0;
        text += isEscape ? static_cast<char>(std::stoi(std::string(name.substr(2, 2)), nullptr, 16))
                         : name.front();
        name.remove_prefix(isEscape ? 4 : 1);
    }
    return text;
}

using NamesOfNodes = std::map<std::string, std::string>;

/// The links of a directory of names, by the last name of the node that each of them leads to.
NamesOfNodes namesIn(const fs::path& directory) {
    NamesOfNodes names;
    std::error_code error;
    for (fs::directory_iterator at(directory, error), end; !error && at != end;
         at.increment(error)) {
        std::error_code noLink;
        const auto node = fs::read_symlink(at->path(), noLink).filename();
        if (!noLink) {
            names.emplace(node, unescaped(at->path().filename().native()));
        }
    }
    return names;
}

std::string nameOf(const std::string& node, const NamesOfNodes& names) {
    const auto found = names.find(node);
    return found == names.end() ? std::string() : found->second;
}

bool isOnUsb(const fs::path& device) {
    return std::ranges::any_of(device, [](const fs::path& name) {
        const auto& text = name.native();
        return text.starts_with("usb") && text.size() > 3 &&
               std::isdigit(static_cast<unsigned char>(text[3])) != 0;
    });
}

/// The kernel calls a medium removable where it can leave its drive; sticks often are not, but on a
/// bus for plugging, and memory cards are of a kind. A partition is in the directory of its disk.
bool isPluggable(const fs::path& entry) {
    std::error_code error;
    const auto device = fs::canonical(entry, error);
    const std::array disks{device, device.parent_path()};
    return !error && (isOnUsb(device) || std::ranges::any_of(disks, [](const fs::path& disk) {
                          return lineOf(disk / "removable") == "1" ||
                                 lineOf(disk / "device/type") == "SD";
                      }));
}

std::vector<Drive> drivesIn(const fs::path& root) {
    const auto uuids = namesIn(root / "dev/disk/by-uuid");
    const auto labels = namesIn(root / "dev/disk/by-label");
    std::vector<Drive> drives;
    std::error_code error;
    for (fs::directory_iterator at(root / "sys/class/block", error), end; !error && at != end;
         at.increment(error)) {
        const auto node = at->path().filename().string();
        drives.push_back({lineOf(at->path() / "dev"),
                          "/dev/" + node,
                          nameOf(node, uuids),
                          nameOf(node, labels),
                          isPluggable(at->path()),
                          {}});
    }
    return drives;
}

} // namespace

Surroundings surroundingsIn(const fs::path& root) {
    std::ifstream table(root / "proc/self/mountinfo");
    const std::string text((std::istreambuf_iterator<char>(table)), {});
    return {base::mountsIn(text), drivesIn(root)};
}

} // namespace quorl::finding
