#include "services/media/playlists/PlaylistContent.h"

#include <algorithm>
#include <array>
#include <charconv>
#include <utility>
#include <vector>

#include <glib.h>

#include "services/base/Utf8.h"
#include "services/media/playlists/Encoding.h"
#include "services/media/playlists/XmlPlaylist.h"

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

/// Takes the marker from the text of a comment, the comment character left out.
void readMarker(std::string_view comment, PlaylistContent& content) {
    constexpr std::string_view marker = "GENERATED";
    if (comment == marker) {
        content.generated = Generated::Playlist;
    } else if (comment.starts_with(marker) && comment[marker.size()] == ':') {
        content.generated = generatedValue(comment.substr(marker.size() + 1));
    }
}

/// Calls `use` with each piece of `bytes` between two `ends`.
template <class Use>
void forEachPiece(std::string_view bytes, char ends, Use use) {
    while (!bytes.empty()) {
        const std::size_t end = std::min(bytes.find(ends), bytes.size());
        use(bytes.substr(0, end));
        bytes.remove_prefix(std::min(end + 1, bytes.size()));
    }
}

/// Calls `use` with each line that has something in it, without the white space around it. One end
/// of lines is looked for after the other, for one character is found many times faster than the
/// first of two.
template <class Use>
void forEachLine(std::string_view bytes, Use use) {
    forEachPiece(bytes, '\n', [&use](std::string_view piece) {
        forEachPiece(base::trimmed(piece), '\r', [&use](std::string_view part) {
            const std::string_view line = base::trimmed(part);
            if (!line.empty()) {
                use(line);
            }
        });
    });
}

std::optional<PlaylistContent> parseM3u(std::string_view bytes) {
    constexpr std::string_view nameDirective = "#PLAYLIST:";
    if (base::trimmed(bytes).starts_with('<')) {
        return std::nullopt; // a page that tells of an error was saved in place of the list
    }
    PlaylistContent content;
    forEachLine(bytes, [&](std::string_view line) {
        if (line.starts_with(nameDirective)) {
            content.name = base::toUtf8(base::trimmed(line.substr(nameDirective.size())));
        } else if (line.front() == '#') {
            readMarker(line.substr(1), content);
        } else {
            content.add(line);
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

std::optional<PlaylistContent> parsePls(std::string_view bytes) {
    bool isPls = false;
    PlaylistContent content;
    std::vector<std::pair<std::uint64_t, std::string_view>> files;
    forEachLine(bytes, [&](std::string_view line) {
        const std::size_t equals = line.find('=');
        if (line.front() == '#' || line.front() == ';') {
            readMarker(line.substr(1), content);
        } else if (equalsIgnoringCase(line, "[playlist]")) {
            isPls = true;
        } else if (equals != std::string_view::npos) {
            if (const auto number = fileNumber(base::trimmed(line.substr(0, equals)))) {
                files.emplace_back(*number, base::trimmed(line.substr(equals + 1)));
            }
        }
    });
    std::ranges::stable_sort(files, {}, &std::pair<std::uint64_t, std::string_view>::first);
    for (const auto& [number, file] : files) {
        content.add(file);
    }
    return isPls || !files.empty() ? std::optional(std::move(content)) : std::nullopt;
}

using Parse = std::optional<PlaylistContent>(std::string_view);

/// What holds a NUL is no text.
std::optional<PlaylistContent> parseUtf8(Parse* parse, std::string_view text) {
    return text.find('\0') == std::string_view::npos ? parse(text) : std::nullopt;
}

std::optional<PlaylistContent> parseText(Parse* parse, std::string_view bytes) {
    const Encoding encoding = encodingOfText(bytes);
    bytes.remove_prefix(encoding.markSize);
    if (encoding.name == "UTF-8") {
        return parseUtf8(parse, bytes);
    }
    const auto text = converted(bytes, encoding.name);
    return text ? parseUtf8(parse, *text) : std::nullopt;
}

} // namespace

void PlaylistContent::add(std::string_view entry) {
    constexpr std::size_t maximumBytes = 2 * maximumPlaylistBytes; // more only by an `xml:base`
    std::string converted;
    if (!base::isUtf8(entry)) {
        converted = base::toUtf8(entry);
        entry = converted;
    }
    truncated = truncated || entries.size() == maximumEntries ||
                entry.size() > maximumBytes - entries.bytes();
    if (!truncated) {
        entries.add(entry);
    }
}

Generated generatedValue(std::string_view value) {
    return base::trimmed(value) == "mix" ? Generated::Mix : Generated::Playlist;
}

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
        content = parseText(&parseM3u, bytes);
        break;
    case Format::Pls:
        content = parseText(&parsePls, bytes);
        break;
    case Format::Xspf:
        content = parseXmlPlaylist(bytes);
        break;
    }
    if (content) {
        content->entries.shrink();
    }
    return content;
}

} // namespace quorl::media
