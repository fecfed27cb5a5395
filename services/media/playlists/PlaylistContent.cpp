#include "services/media/playlists/PlaylistContent.h"

#include <algorithm>
#include <array>
#include <charconv>
#include <utility>
#include <vector>

#include <glib.h>
#include <pugixml.hpp>

#include "services/base/Utf8.h"

namespace quorl::media {

namespace {

struct Extension {
    std::string_view text;
    Format format;
};

constexpr std::array extensions{
    Extension{".m3u", Format::M3u},
    Extension{".m3u8", Format::M3u},
    Extension{".pls", Format::Pls},
    Extension{".xspf", Format::Xspf},
};

bool equalsIgnoringCase(std::string_view left, std::string_view right) {
    return left.size() == right.size() &&
           g_ascii_strncasecmp(left.data(), right.data(), left.size()) == 0;
}

Generated generatedValue(std::string_view value) {
    return base::trimmed(value) == "mix" ? Generated::Mix : Generated::Playlist;
}

/// Takes the marker from the text of a comment, the comment character left out.
void readMarker(std::string_view comment, PlaylistContent& content) {
    constexpr std::string_view marker = "GENERATED";
    if (comment == marker) {
        content.generated = Generated::Playlist;
    } else if (comment.starts_with(marker) && comment[marker.size()] == ':') {
        content.generated = generatedValue(comment.substr(marker.size() + 1));
    }
}

void addEntry(std::string_view entry, PlaylistContent& content) {
    if (content.entries.size() == maximumEntries) {
        content.truncated = true;
    } else {
        content.entries.add(base::toUtf8(entry));
    }
}

/// Calls `use` with each line that has something in it, without the white space around it.
template <class Use>
void forEachLine(std::string_view bytes, Use use) {
    constexpr std::string_view byteOrderMark = "\uFEFF";
    if (bytes.starts_with(byteOrderMark)) {
        bytes.remove_prefix(byteOrderMark.size());
    }
    while (!bytes.empty()) {
        const std::size_t end = std::min(bytes.find_first_of("\r\n"), bytes.size());
        const std::string_view line = base::trimmed(bytes.substr(0, end));
        if (!line.empty()) {
            use(line);
        }
        bytes.remove_prefix(std::min(end + 1, bytes.size()));
    }
}

PlaylistContent parseM3u(std::string_view bytes) {
    constexpr std::string_view nameDirective = "#PLAYLIST:";
    PlaylistContent content;
    forEachLine(bytes, [&](std::string_view line) {
        if (line.starts_with(nameDirective)) {
            content.name = base::toUtf8(base::trimmed(line.substr(nameDirective.size())));
        } else if (line.front() == '#') {
            readMarker(line.substr(1), content);
        } else {
            addEntry(line, content);
        }
    });
    return content;
}

/// The number N of a `FileN` key; null: another key.
std::optional<std::uint64_t> fileNumber(std::string_view key) {
    constexpr std::string_view prefix = "File";
    if (!equalsIgnoringCase(key.substr(0, prefix.size()), prefix)) {
        return std::nullopt;
    }
    const char* const end = key.data() + key.size();
    std::uint64_t number = 0;
    const auto result = std::from_chars(key.data() + prefix.size(), end, number);
    return result.ec == std::errc() && result.ptr == end ? std::optional(number) : std::nullopt;
}

PlaylistContent parsePls(std::string_view bytes) {
    PlaylistContent content;
    std::vector<std::pair<std::uint64_t, std::string_view>> files;
    forEachLine(bytes, [&](std::string_view line) {
        const std::size_t equals = line.find('=');
        if (line.front() == '#' || line.front() == ';') {
            readMarker(line.substr(1), content);
        } else if (equals != std::string_view::npos) {
            if (const auto number = fileNumber(base::trimmed(line.substr(0, equals)))) {
                files.emplace_back(*number, base::trimmed(line.substr(equals + 1)));
            }
        }
    });
    std::ranges::stable_sort(files, {}, &std::pair<std::uint64_t, std::string_view>::first);
    for (const auto& [number, file] : files) {
        addEntry(file, content);
    }
    return content;
}

/// Whether `node` is an element of this name, in whichever namespace prefix.
bool isElement(const pugi::xml_node& node, std::string_view name) {
    std::string_view ownName = node.name();
    ownName.remove_prefix(std::min(ownName.find(':') + 1, ownName.size()));
    return ownName == name;
}

std::string_view textOf(const pugi::xml_node& element) {
    return base::trimmed(element.text().get());
}

/// The address of a track: its first location, or the first that is on this machine, for a track
/// may list several places where the same song is found.
std::string_view locationOf(const pugi::xml_node& track) {
    std::string_view location;
    for (const pugi::xml_node& child : track) {
        if (!isElement(child, "location")) {
            continue;
        }
        const std::string_view candidate = textOf(child);
        const bool local =
            candidate.starts_with("file:") || candidate.find("://") == std::string_view::npos;
        if (local && !candidate.empty()) {
            return candidate;
        }
        location = location.empty() ? candidate : location;
    }
    return location;
}

void readTracks(const pugi::xml_node& trackList, PlaylistContent& content) {
    for (const pugi::xml_node& track : trackList) {
        if (isElement(track, "track")) {
            addEntry(locationOf(track), content);
        }
    }
}

std::optional<PlaylistContent> parseXspf(std::string_view bytes) {
    pugi::xml_document document;
    if (!document.load_buffer(bytes.data(), bytes.size())) {
        return std::nullopt;
    }
    const pugi::xml_node playlist = document.document_element();
    if (!isElement(playlist, "playlist")) {
        return std::nullopt;
    }
    PlaylistContent content;
    for (const pugi::xml_node& child : playlist) {
        if (isElement(child, "title")) {
            content.name = base::toUtf8(textOf(child));
        } else if (isElement(child, "meta") &&
                   child.attribute("rel").value() == std::string_view("urn:quorl:generated")) {
            content.generated = generatedValue(textOf(child));
        } else if (isElement(child, "trackList")) {
            readTracks(child, content);
        }
    }
    return content;
}

} // namespace

std::optional<Format> playlistFormat(std::string_view fileName) {
    const std::size_t dot = fileName.rfind('.');
    if (dot == std::string_view::npos) {
        return std::nullopt;
    }
    for (const Extension& extension : extensions) {
        if (equalsIgnoringCase(fileName.substr(dot), extension.text)) {
            return extension.format;
        }
    }
    return std::nullopt;
}

std::optional<PlaylistContent> parsePlaylist(Format format, std::string_view bytes) {
    std::optional<PlaylistContent> content;
    switch (format) {
    case Format::M3u:
        content = parseM3u(bytes);
        break;
    case Format::Pls:
        content = parsePls(bytes);
        break;
    case Format::Xspf:
        content = parseXspf(bytes);
        break;
    }
    if (content) {
        content->entries.shrink();
    }
    return content;
}

} // namespace quorl::media
