#include "services/wearable/Manifest.h"

#include <algorithm>
#include <charconv>
#include <utility>

#include <nlohmann/json.hpp>

#include "services/language/Translated.h"
#include "services/wearable/Wearable.h"

namespace quorl::wearable {

using language::toTranslate;

namespace {

/// What we have never written.
struct Wrong : std::runtime_error {
    using std::runtime_error::runtime_error;
};

using nlohmann::json;

constexpr int format = 1;
constexpr int hexadecimal = 16;

/// Paths are bytes, and JSON is UTF-8: what is not plain ASCII is kept as %XX.
std::string encoded(std::string_view bytes) {
    constexpr std::string_view digits = "0123456789ABCDEF";
    std::string text;
    for (const char byte : bytes) {
        const auto value = static_cast<unsigned char>(byte);
        if (byte >= ' ' && byte <= '~' && byte != '%') {
            text += byte;
        } else {
            text += '%';
            text += digits[value / hexadecimal];
            text += digits[value % hexadecimal];
        }
    }
    return text;
}

std::string decoded(std::string_view text) {
    std::string bytes;
    while (!text.empty()) {
        if (text.front() != '%') {
            bytes += text.front();
            text.remove_prefix(1);
            continue;
        }
        unsigned char value = 0;
        const auto digits = text.substr(1, 2);
        const auto* const end = digits.data() + digits.size();
        const auto read = std::from_chars(digits.data(), end, value, hexadecimal);
        if (digits.size() != 2 || read.ec != std::errc{} || read.ptr != end) {
            throw Wrong{toTranslate("a path is not well-formed")};
        }
        bytes += static_cast<char>(value);
        text.remove_prefix(3);
    }
    return bytes;
}

json toJson(const Entry& entry) {
    return {{"name", entry.name},
            {"source", encoded(entry.source)},
            {"size", entry.size},
            {"modified", entry.modified},
            {"hash", entry.hash}};
}

json toJson(const std::vector<Entry>& entries) {
    auto list = json::array();
    for (const auto& entry : entries) {
        list.push_back(toJson(entry));
    }
    return list;
}

/// The device may have been in other hands, and names are used to remove files.
std::string checkedName(std::string name) {
    const bool leadsElsewhere = name.empty() || name == "." || name == ".." ||
                                name.find('/') != std::string::npos ||
                                name.find('\0') != std::string::npos;
    if (leadsElsewhere) {
        throw Wrong{toTranslate("a name leads out of the music directory")};
    }
    return name;
}

template <class Number>
Number numberOf(const json& value) {
    const bool fits =
        value.is_number_unsigned()
            ? std::in_range<Number>(value.get<std::uint64_t>())
            : value.is_number_integer() && std::in_range<Number>(value.get<std::int64_t>());
    if (!fits) {
        throw Wrong{toTranslate("a number in it is not a whole one, or out of range")};
    }
    return value.get<Number>();
}

Entry entryOf(const json& value) {
    return {checkedName(value.at("name").get<std::string>()),
            decoded(value.at("source").get<std::string>()),
            numberOf<std::uint64_t>(value.at("size")), numberOf<std::int64_t>(value.at("modified")),
            value.at("hash").get<std::string>()};
}

Selection selectionOf(const json& value) {
    return {numberOf<std::uint64_t>(value.at("playlist")),
            numberOf<std::uint64_t>(value.at("revision")),
            numberOf<std::uint64_t>(value.at("limitType")),
            numberOf<std::uint64_t>(value.at("limit"))};
}

std::vector<Entry> entriesOf(const json& list) {
    std::vector<Entry> entries;
    std::ranges::transform(list, std::back_inserter(entries), entryOf);
    return entries;
}

Manifest manifestOf(const json& value) {
    if (value.at("format") != format) {
        throw Wrong{toTranslate("a later version has written it")};
    }
    Manifest manifest{entriesOf(value.at("songs")), {}, entriesOf(value.at("strays")), {}};
    if (value.contains("playlist")) {
        manifest.playlist = entryOf(value.at("playlist"));
    }
    if (value.contains("sent")) {
        manifest.sent = selectionOf(value.at("sent"));
    }
    return manifest;
}

/// Each level costs memory many times its length.
json parsed(std::string_view text) {
    constexpr int deepest = 8;
    return json::parse(text, [](int depth, json::parse_event_t /*event*/, const json& /*value*/) {
        if (depth > deepest) {
            throw Wrong{toTranslate("it is nested too deeply")};
        }
        return true;
    });
}

} // namespace

void rejectManifest(const std::string& why) {
    throw BadManifest{{unseen::badManifest, {why}},
                      "The list of the music on the " + std::string{wearableName} +
                          " cannot be used (" + why + "). Remove the files " + ownDirectory +
                          "/manifest.* from it to begin anew; the music that is on it then stays."};
}

std::string toText(const Manifest& manifest) {
    json value{
        {"format", format}, {"songs", toJson(manifest.songs)}, {"strays", toJson(manifest.strays)}};
    if (manifest.playlist) {
        value["playlist"] = toJson(*manifest.playlist);
    }
    if (const auto& sent = manifest.sent) {
        value["sent"] = {{"playlist", sent->playlist},
                         {"revision", sent->revision},
                         {"limitType", sent->limitType},
                         {"limit", sent->limit}};
    }
    return value.dump(1) + "\n";
}

Manifest parseManifest(std::string_view text) {
    if (text.empty()) {
        return {};
    }
    try {
        return manifestOf(parsed(text));
    } catch (const json::exception&) {
        rejectManifest(toTranslate("it is not well-formed"));
    } catch (const Wrong& error) {
        rejectManifest(error.what());
    }
}

} // namespace quorl::wearable
