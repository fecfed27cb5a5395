#include "services/base/MountTable.h"

#include <optional>
#include <sstream>

#include "services/base/Paths.h"

namespace quorl::base {

namespace {

/// A field of the table, in which blanks and backslashes are written as three octal digits.
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

bool isReadOnly(const std::string& options) {
    return options == "ro" || options.starts_with("ro,");
}

/// "id parent device root directory options [optional field]... - type source options"
std::optional<Mount> mountIn(const std::string& line) {
    std::istringstream fields(line);
    Mount mount;
    std::string parent, root, directory, options, source, ofFileSystem;
    fields >> mount.id >> parent >> mount.device >> root >> directory >> options;
    for (std::string field; fields >> field && field != "-";) {
    }
    if (!(fields >> mount.type >> source)) {
        return std::nullopt;
    }
    fields >> ofFileSystem;
    mount.root = unescaped(root);
    mount.directory = unescaped(directory);
    mount.isReadOnly = isReadOnly(options) || isReadOnly(ofFileSystem);
    mount.source = unescaped(source);
    return mount;
}

bool isOn(const std::string& path, const Mount& mount) {
    return mount.directory == "/" || isWithin(path, mount.directory.native());
}

} // namespace

std::vector<Mount> mountsIn(std::string_view table) {
    std::vector<Mount> mounts;
    std::istringstream lines{std::string(table)};
    for (std::string line; std::getline(lines, line);) {
        if (auto mount = mountIn(line)) {
            mounts.push_back(std::move(*mount));
        }
    }
    return mounts;
}

const Mount* mountOver(const std::filesystem::path& path, const std::vector<Mount>& mounts) {
    const Mount* over = nullptr;
    for (const auto& mount : mounts) {
        const bool isCloser =
            over == nullptr || mount.directory.native().size() >= over->directory.native().size();
        if (isCloser && isOn(path.native(), mount)) {
            over = &mount;
        }
    }
    return over;
}

} // namespace quorl::base
