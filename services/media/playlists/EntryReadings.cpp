#include "services/media/playlists/EntryReadings.h"

#include <algorithm>
#include <optional>

#include <glib.h>

namespace quorl::media {

namespace {

/// `text` with `%41` and the like replaced; null where nothing is encoded, or not validly, or a
/// NUL.
std::optional<std::string> percentDecoded(std::string_view text) {
    if (text.find('%') == std::string_view::npos) {
        return std::nullopt;
    }
    char* const decoded = g_uri_unescape_segment(text.data(), text.data() + text.size(), nullptr);
    if (decoded == nullptr) {
        return std::nullopt;
    }
    std::string result = decoded;
    g_free(decoded);
    return result;
}

std::string withForwardSlashes(std::string_view text) {
    std::string result(text);
    std::ranges::replace(result, '\\', '/');
    return result;
}

/// `C:\…`, `C:/…`, `\…` and `\\server\…`, also with the slash that a `file:` address puts in front.
bool isPathOfAnotherSystem(std::string_view path) {
    if (path.starts_with('\\')) {
        return true;
    }
    if (path.starts_with('/')) {
        path.remove_prefix(1);
    }
    return path.size() >= 3 && g_ascii_isalpha(path[0]) && path[1] == ':' &&
           (path[2] == '\\' || path[2] == '/');
}

bool isRemoteAddress(std::string_view entry) {
    const std::size_t scheme = entry.find("://");
    return scheme != std::string_view::npos && scheme > 0 &&
           std::ranges::all_of(entry.substr(0, scheme), [](char character) {
               return g_ascii_isalnum(character) || character == '+' || character == '-' ||
                      character == '.';
           });
}

bool isFileAddress(std::string_view entry) {
    constexpr std::string_view scheme = "file:";
    return entry.size() > scheme.size() &&
           g_ascii_strncasecmp(entry.data(), scheme.data(), scheme.size()) == 0;
}

void addReading(std::string path, EntryReadings& readings) {
    if (std::ranges::find(readings, path) == readings.end()) {
        readings.push_back(std::move(path));
    }
}

std::variant<EntryReadings, Reason> readFileAddress(std::string_view address) {
    constexpr std::string_view authorityMark = "//";
    std::string_view path = address;
    if (path.starts_with(authorityMark)) {
        path.remove_prefix(authorityMark.size());
        if (isPathOfAnotherSystem(path) && !path.starts_with('/')) {
            return Reason::OtherSystem;
        }
        const std::string_view host = path.substr(0, path.find('/'));
        if (!host.empty() && host != "localhost") {
            return Reason::RemoteAddress;
        }
        path.remove_prefix(host.size());
    }
    EntryReadings readings;
    if (auto decoded = percentDecoded(path)) {
        readings.push_back(*std::move(decoded));
    }
    addReading(std::string(path), readings);
    if (isPathOfAnotherSystem(readings.front())) {
        return Reason::OtherSystem;
    }
    return readings;
}

} // namespace

std::variant<EntryReadings, Reason> readEntry(std::string_view entry, Format format) {
    if (entry.empty()) {
        return Reason::NoAddress;
    }
    if (entry.find('\0') != std::string_view::npos) {
        return Reason::Missing;
    }
    if (isFileAddress(entry)) {
        return readFileAddress(entry.substr(entry.find(':') + 1));
    }
    if (isRemoteAddress(entry)) {
        return Reason::RemoteAddress;
    }
    const std::string withSlashes = withForwardSlashes(entry);
    auto decoded = percentDecoded(withSlashes);
    if (isPathOfAnotherSystem(entry) || (decoded && isPathOfAnotherSystem(*decoded))) {
        return Reason::OtherSystem;
    }
    EntryReadings readings;
    if (decoded && format == Format::Xspf) {
        readings.push_back(*decoded);
    }
    readings.emplace_back(entry);
    addReading(withSlashes, readings);
    if (decoded) {
        addReading(*std::move(decoded), readings);
    }
    return readings;
}

} // namespace quorl::media
