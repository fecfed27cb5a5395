#include "services/media/playlists/XmlPlaylist.h"

#include <algorithm>
#include <string>

#include <glib.h>
#include <pugixml.hpp>

#include "services/base/Utf8.h"
#include "services/media/playlists/Address.h"
#include "services/media/playlists/Encoding.h"

namespace quorl::media {

namespace {

/// Whether `node` is an element of this name, in whichever namespace prefix.
bool isElement(const pugi::xml_node& node, std::string_view name) {
    std::string_view ownName = node.name();
    ownName.remove_prefix(std::min(ownName.find(':') + 1, ownName.size()));
    return ownName == name;
}

std::string_view textOf(const pugi::xml_node& element) {
    return base::trimmed(element.text().get());
}

/// The base of what is in `element`, where `outer` is that of the element itself.
std::string baseIn(const pugi::xml_node& element, const std::string& outer) {
    constexpr std::size_t longest = 4096; // longer ones lead nowhere, and every track repeats them
    const std::string_view base = base::trimmed(element.attribute("xml:base").value());
    return resolved(outer, base.substr(0, longest));
}

std::string addressAt(const pugi::xml_node& location, const std::string& outer) {
    const std::string_view text = textOf(location);
    const std::string base = baseIn(location, outer);
    return base.empty() || text.empty() ? std::string(text) : resolved(base, text);
}

/// The address of a track: its first location, or the first that is on this machine, for a track
/// may list several places where the same song is found.
std::string addressOf(const pugi::xml_node& track, const std::string& base) {
    std::string address;
    for (const pugi::xml_node& child : track) {
        if (!isElement(child, "location")) {
            continue;
        }
        std::string candidate = addressAt(child, base);
        const bool local =
            candidate.starts_with("file:") || candidate.find("://") == std::string_view::npos;
        if (local && !candidate.empty()) {
            return candidate;
        }
        address = address.empty() ? std::move(candidate) : address;
    }
    return address;
}

void readTracks(const pugi::xml_node& trackList, const std::string& base,
                PlaylistContent& content) {
    for (const pugi::xml_node& track : trackList) {
        if (isElement(track, "track") && !content.truncated) {
            content.add(addressOf(track, baseIn(track, base)));
        }
    }
}

PlaylistContent read(const pugi::xml_node& playlist) {
    PlaylistContent content;
    const std::string base = baseIn(playlist, {});
    for (const pugi::xml_node& child : playlist) {
        if (isElement(child, "title")) {
            content.name = base::toUtf8(textOf(child));
        } else if (isElement(child, "meta") &&
                   child.attribute("rel").value() == std::string_view("urn:quorl:generated")) {
            content.generated = generatedValue(textOf(child));
        } else if (isElement(child, "trackList")) {
            readTracks(child, baseIn(child, base), content);
        }
    }
    return content;
}

/// Whether the parser itself tells the encoding from the bytes. A declaration of UTF-16 that can be
/// read as ASCII was left behind by a conversion to UTF-8.
bool isKnownToParser(std::string_view encoding) {
    return encoding.empty() || g_ascii_strncasecmp(encoding.data(), "UTF-", 4) == 0;
}

bool load(std::string_view bytes, pugi::xml_document& document) {
    const std::string_view encoding = declaredEncoding(bytes);
    if (isKnownToParser(encoding)) {
        return static_cast<bool>(document.load_buffer(bytes.data(), bytes.size()));
    }
    const auto text = converted(bytes, std::string(encoding));
    return text && document.load_buffer(text->data(), text->size(), pugi::parse_default,
                                        pugi::encoding_utf8);
}

} // namespace

std::optional<PlaylistContent> parseXmlPlaylist(std::string_view bytes) {
    pugi::xml_document document;
    if (!load(bytes, document) || !isElement(document.document_element(), "playlist")) {
        return std::nullopt;
    }
    return read(document.document_element());
}

} // namespace quorl::media
