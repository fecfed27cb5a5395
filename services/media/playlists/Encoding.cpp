#include "services/media/playlists/Encoding.h"

#include <algorithm>
#include <array>

#include <glib.h>

namespace quorl::media {

namespace {

using namespace std::string_view_literals;

struct Mark {
    std::string_view bytes;
    const char* encoding;
};

/// Those of UTF-32 first, for one of them begins like one of UTF-16.
constexpr std::array marks{
    Mark{"\xEF\xBB\xBF"sv, "UTF-8"},    Mark{"\xFF\xFE\0\0"sv, "UTF-32LE"},
    Mark{"\0\0\xFE\xFF"sv, "UTF-32BE"}, Mark{"\xFF\xFE"sv, "UTF-16LE"},
    Mark{"\xFE\xFF"sv, "UTF-16BE"},
};

bool isAsciiCharacter(char byte) { return byte > 0; }

} // namespace

Encoding encodingOfText(std::string_view bytes) {
    for (const Mark& mark : marks) {
        if (bytes.starts_with(mark.bytes)) {
            return {mark.encoding, mark.bytes.size()};
        }
    }
    if (bytes.size() < 2) {
        return {"UTF-8"};
    }
    if (isAsciiCharacter(bytes[0]) && bytes[1] == '\0') {
        return {"UTF-16LE"};
    }
    return {bytes[0] == '\0' && isAsciiCharacter(bytes[1]) ? "UTF-16BE" : "UTF-8"};
}

std::string_view declaredEncoding(std::string_view xml) {
    constexpr std::string_view attribute = "encoding";
    if (!xml.starts_with("<?xml")) {
        return {};
    }
    xml = xml.substr(0, xml.find("?>"));
    const std::size_t name = xml.find(attribute);
    const std::size_t open =
        name == std::string_view::npos ? name : xml.find_first_of("\"'", name + attribute.size());
    if (open == std::string_view::npos) {
        return {};
    }
    const std::size_t close = std::min(xml.find(xml[open], open + 1), xml.size());
    return xml.substr(open + 1, close - open - 1);
}

std::optional<std::string> converted(std::string_view bytes, const std::string& encoding) {
    gsize size = 0;
    char* const text = g_convert(bytes.data(), static_cast<gssize>(bytes.size()), "UTF-8",
                                 encoding.c_str(), nullptr, &size, nullptr);
    if (text == nullptr) {
        return std::nullopt;
    }
    std::string result(text, size);
    g_free(text);
    return result;
}

} // namespace quorl::media
