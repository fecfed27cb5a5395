#include "services/media/playlists/Address.h"

#include <algorithm>
#include <vector>

#include <glib.h>

namespace quorl::media {

namespace {

/// `scheme` and `authority` include the characters that mark them: `file:` and `//host`.
struct Address {
    std::string_view scheme;
    std::string_view authority;
    std::string_view path;
};

bool isScheme(std::string_view text) {
    return !text.empty() && g_ascii_isalpha(text.front()) &&
           std::ranges::all_of(text, [](char character) {
               return g_ascii_isalnum(character) || character == '+' || character == '-' ||
                      character == '.';
           });
}

/// Takes the first `length` characters off `text`.
std::string_view take(std::size_t length, std::string_view& text) {
    const std::string_view taken = text.substr(0, length);
    text.remove_prefix(taken.size());
    return taken;
}

Address parted(std::string_view text) {
    Address address;
    const std::size_t colon = text.find(':');
    if (colon != std::string_view::npos && isScheme(text.substr(0, colon))) {
        address.scheme = take(colon + 1, text);
    }
    if (text.starts_with("//")) {
        address.authority = take(text.find('/', 2), text);
    }
    address.path = text;
    return address;
}

/// Adds what comes after a slash to the `segments` before it. The first of a rooted path is empty.
void addSegment(std::string_view segment, bool rooted, std::vector<std::string_view>& segments) {
    const bool isUp = segment == "..";
    const bool canGoUp = segments.size() > (rooted ? 1U : 0U) && segments.back() != "..";
    if (isUp && canGoUp) {
        segments.pop_back();
    } else if (!isUp || !rooted) {
        segments.push_back(segment);
    }
}

std::string withoutDotSegments(std::string_view path) {
    const bool rooted = path.starts_with('/');
    std::vector<std::string_view> segments;
    while (!path.empty()) {
        const std::string_view segment = take(path.find('/'), path);
        const bool last = path.empty();
        path.remove_prefix(last ? 0 : 1);
        if (segment != ".") {
            addSegment(segment, rooted, segments);
        }
        if (last ? segment == "." || segment == ".." : path.empty()) {
            segments.emplace_back(); // a directory, whose address ends in a slash
        }
    }
    std::string result;
    for (std::size_t index = 0; index < segments.size(); ++index) {
        result.append(index == 0 ? "" : "/").append(segments[index]);
    }
    return result;
}

/// Where the relative `path` leads from `base`.
std::string merged(const Address& base, std::string_view path) {
    const std::string_view plain = base.path.substr(0, base.path.find_first_of("?#"));
    if (plain.empty() && !base.authority.empty()) {
        return std::string("/").append(path);
    }
    return std::string(plain.substr(0, plain.rfind('/') + 1)).append(path);
}

} // namespace

std::string resolved(std::string_view base, std::string_view reference) {
    const Address from = parted(base);
    const Address to = parted(reference);
    if (reference.empty() || !to.scheme.empty()) {
        return std::string(reference.empty() ? base : reference);
    }
    std::string result(from.scheme);
    if (!to.authority.empty()) {
        return result.append(reference);
    }
    const std::string path =
        to.path.starts_with('/') ? std::string(to.path) : merged(from, to.path);
    return result.append(from.authority).append(withoutDotSegments(path));
}

} // namespace quorl::media
