#include "services/base/Utf8.h"

#include <algorithm>
#include <array>
#include <memory>

#include <glib.h>

namespace quorl::base {

namespace {

struct FreeWithGLib {
    void operator()(char* text) const { g_free(text); }
};

using GLibText = std::unique_ptr<char, FreeWithGLib>;

constexpr std::string_view replacement = "\uFFFD";

/// What Windows-1252 has in place of the control characters U+0080 to U+009F of Latin-1. Where it
/// has nothing, the control character stays.
constexpr std::array<char16_t, 32> windowsCharacters{
    0x20AC, 0x0081, 0x201A, 0x0192, 0x201E, 0x2026, 0x2020, 0x2021, 0x02C6, 0x2030, 0x0160,
    0x2039, 0x0152, 0x008D, 0x017D, 0x008F, 0x0090, 0x2018, 0x2019, 0x201C, 0x201D, 0x2022,
    0x2013, 0x2014, 0x02DC, 0x2122, 0x0161, 0x203A, 0x0153, 0x009D, 0x017E, 0x0178};

gunichar characterOfByte(char byte) {
    const auto value = static_cast<unsigned char>(byte);
    return value >= 0x80 && value < 0xA0 ? windowsCharacters[value - 0x80u] : value;
}

void append(std::string& text, gunichar character) {
    std::array<char, 6> bytes{};
    const int length = g_unichar_to_utf8(character, bytes.data());
    text.append(bytes.data(), static_cast<std::size_t>(length));
}

bool isSpace(char character) {
    return character == ' ' || (character >= '\t' && character <= '\r');
}

/// Whether a terminal that is shown the character may do something else than to draw it: move,
/// clear, or show what follows in another order.
bool isSteering(gunichar character) {
    constexpr gunichar lineSeparator = 0x2028;
    constexpr gunichar lastOverride = 0x202E;
    constexpr gunichar firstIsolate = 0x2066;
    constexpr gunichar lastIsolate = 0x2069;
    return g_unichar_iscntrl(character) ||
           (character >= lineSeparator && character <= lastOverride) ||
           (character >= firstIsolate && character <= lastIsolate);
}

/// Most names are plain ASCII, which has one form alone.
std::string normalised(std::string_view text, GNormalizeMode mode) {
    if (isAscii(text) || !g_utf8_validate_len(text.data(), text.size(), nullptr)) {
        return std::string(text);
    }
    return GLibText(g_utf8_normalize(text.data(), static_cast<gssize>(text.size()), mode)).get();
}

} // namespace

std::string_view trimmed(std::string_view text) {
    while (!text.empty() && isSpace(text.front())) {
        text.remove_prefix(1);
    }
    while (!text.empty() && isSpace(text.back())) {
        text.remove_suffix(1);
    }
    return text;
}

std::string toUtf8(std::string_view text) {
    if (isUtf8(text)) {
        return std::string(text);
    }
    std::string result;
    result.reserve(text.size() + text.size() / 4);
    for (const char byte : text) {
        append(result, characterOfByte(byte));
    }
    return result;
}

std::string validUtf8(std::string_view text) {
    std::string result;
    while (!text.empty()) {
        const char* end = nullptr;
        g_utf8_validate_len(text.data(), text.size(), &end);
        const auto valid = static_cast<std::size_t>(end - text.data());
        result.append(text.substr(0, valid));
        text.remove_prefix(valid);
        if (!text.empty()) {
            result.append(replacement);
            text.remove_prefix(1);
        }
    }
    return result;
}

std::string printable(std::string_view text) {
    const std::string valid = validUtf8(text);
    std::string result;
    result.reserve(valid.size());
    const char* const end = valid.data() + valid.size();
    for (const char* at = valid.data(); at != end; at = g_utf8_next_char(at)) {
        const gunichar character = g_utf8_get_char(at);
        append(result, isSteering(character) ? gunichar{0xFFFD} : character);
    }
    return result;
}

std::string composed(std::string_view text) { return normalised(text, G_NORMALIZE_NFC); }

std::string decomposed(std::string_view text) { return normalised(text, G_NORMALIZE_NFD); }

bool isUtf8(std::string_view text) {
    return isAscii(text) || g_utf8_validate_len(text.data(), text.size(), nullptr) != FALSE;
}

bool isAscii(std::string_view text) {
    // To the end in any case, so that many bytes are looked at together.
    unsigned char all = 0;
    for (const char byte : text) {
        all |= static_cast<unsigned char>(byte);
    }
    return all < 0x80;
}

} // namespace quorl::base
