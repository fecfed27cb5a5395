#include "services/media/EntryResolver.h"

#include <algorithm>
#include <cerrno>
#include <cstdlib>
#include <filesystem>

#include <sys/stat.h>

#include "services/base/FileStatus.h"
#include "services/base/MallocText.h"
#include "services/base/Paths.h"
#include "services/base/Utf8.h"
#include "services/media/playlists/EntryReadings.h"

namespace quorl::media {

namespace {

/// The directory that `path` reaches from `directory`, and what is left of `path` from its last
/// component on. Null: the way leads through something that is not in the tree. As no directory in
/// the tree is a symbolic link, `..` is the parent.
Directory* follow(Directory& directory, std::string_view& path) {
    Directory* at = &directory;
    for (std::size_t slash = path.find('/'); at != nullptr && slash != std::string_view::npos;
         slash = path.find('/')) {
        const std::string_view component = path.substr(0, slash);
        path.remove_prefix(slash + 1);
        if (component == "..") {
            at = at->parent;
        } else if (!component.empty() && component != ".") {
            at = at->child(component);
        }
    }
    return at;
}

/// Whether `entry` can be read in one way only, as the path that is written there.
bool isPlainPath(std::string_view entry) {
    // To the end in any case, so that many bytes are looked at together.
    unsigned special = 0;
    for (const char character : entry) {
        special |=
            static_cast<unsigned>(character == '\0') | static_cast<unsigned>(character == '%') |
            static_cast<unsigned>(character == ':') | static_cast<unsigned>(character == '\\');
    }
    return special == 0 && !entry.empty();
}

/// Whether the way may lead through a directory in which its end is not.
bool hasDetour(std::string_view path) {
    constexpr std::string_view up = "../";
    while (path.starts_with(up)) {
        path.remove_prefix(up.size());
    }
    return path.find("/..") != std::string_view::npos;
}

bool isHidden(std::string_view path) {
    return path.starts_with('.') || path.find("/.") != std::string_view::npos;
}

bool isMissing(const Resolved& result) {
    const Reason* const reason = std::get_if<Reason>(&result);
    return reason != nullptr && *reason == Reason::Missing;
}

} // namespace

EntryResolver::EntryResolver(const FolderTree& tree)
    : tree_(tree), givenRoot_(tree.root() == "/" ? std::string() : tree.root().string()) {}

Resolution EntryResolver::resolve(Directory& directory, std::string_view entry,
                                  Format format) const {
    if (isPlainPath(entry)) {
        if (const auto found = find(directory, entry)) {
            return *found;
        }
    }
    const auto read = readEntry(entry, format);
    if (const Reason* const reason = std::get_if<Reason>(&read)) {
        return {*reason, Basis::Text};
    }
    const auto& readings = std::get<EntryReadings>(read);
    for (const std::string& path : readings) {
        if (const auto found = find(directory, path)) {
            return {found->meaning, &path == &readings.front() ? found->basis : Basis::Names};
        }
    }
    Resolved result = Reason::Missing;
    for (const std::string& path : readings) {
        if (isMissing(result)) {
            result = examine(directory, path);
        }
    }
    return {result, Basis::Files};
}

std::optional<Resolution> EntryResolver::find(Directory& directory, std::string_view path) const {
    if (const auto found = locate(directory, path)) {
        return Resolution{*found, hasDetour(path) ? Basis::Names : Basis::Song};
    }
    const auto found = locateInOtherNormalisation(directory, path);
    return found ? std::optional(Resolution{*found, Basis::Names}) : std::nullopt;
}

std::optional<FoundSong> EntryResolver::locateInOtherNormalisation(Directory& directory,
                                                                   std::string_view path) const {
    if (base::isAscii(path)) {
        return std::nullopt;
    }
    const auto found = locate(directory, base::composed(path));
    return found ? found : locate(directory, base::decomposed(path));
}

std::optional<FoundSong> EntryResolver::locate(Directory& directory, std::string_view path) const {
    Directory* start = &directory;
    if (path.starts_with('/')) {
        const auto relative = relativeToRoot(path);
        if (!relative) {
            return std::nullopt;
        }
        start = tree_.top();
        path = *relative;
    }
    Directory* const holder = follow(*start, path);
    SongFile* const file = holder == nullptr ? nullptr : holder->song(path);
    return file == nullptr ? std::nullopt : std::optional(FoundSong{holder, file});
}

Resolved EntryResolver::examine(const Directory& directory, const std::string& path) const {
    const std::string absolute =
        path.starts_with('/') ? path : tree_.absolute(directory.pathOf(path));
    base::FileStatus status{};
    if (stat(absolute.c_str(), &status) == 0) {
        return examineExisting(absolute, S_ISREG(status.st_mode));
    }
    const bool denied = errno == EACCES;
    if (!relativeToRoot(std::filesystem::path(absolute).lexically_normal().native())) {
        return Reason::OutsideFolder;
    }
    return denied ? Reason::Unreachable : Reason::Missing;
}

Resolved EntryResolver::examineExisting(const std::string& path, bool regular) const {
    const base::MallocText canonical(realpath(path.c_str(), nullptr));
    if (!canonical) {
        return Reason::Missing;
    }
    const std::string_view target = canonical.get();
    if (!base::isWithin(target, tree_.canonicalRoot())) {
        return Reason::OutsideFolder;
    }
    if (!regular) {
        return Reason::NotRegularFile;
    }
    if (const auto found = locate(*tree_.top(), target)) {
        return *found;
    }
    return isHidden(*relativeToRoot(target)) ? Reason::Hidden : Reason::NotMusic;
}

std::optional<std::string_view> EntryResolver::relativeToRoot(std::string_view path) const {
    for (const std::string_view root :
         {std::string_view(tree_.canonicalRoot()), std::string_view(givenRoot_)}) {
        if (base::isWithin(path, root)) {
            return path.substr(std::min(root.size() + 1, path.size()));
        }
    }
    return std::nullopt;
}

} // namespace quorl::media
