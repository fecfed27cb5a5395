#include "quorl/terminal/sheets/TerminalText.h"

#include <algorithm>
#include <memory>
#include <sstream>
#include <stdexcept>

#include <glib.h>
#include <unicode/brkiter.h>
#include <unicode/utext.h>

namespace quorl {

namespace {

constexpr std::string_view ellipsis = "…";

using Characters = std::vector<std::string_view>;

void require(UErrorCode code) {
    if (U_FAILURE(code)) {
        throw std::runtime_error(std::string("The tables of characters cannot be read: ") +
                                 u_errorName(code));
    }
}

std::unique_ptr<icu::BreakIterator> makeBreaks() {
    UErrorCode code = U_ZERO_ERROR;
    std::unique_ptr<icu::BreakIterator> breaks(
        icu::BreakIterator::createCharacterInstance(icu::Locale::getRoot(), code));
    require(code);
    return breaks;
}

/// Those that a person counts: each is a letter with its marks, or a sequence shown as one sign.
Characters charactersOf(std::string_view text) {
    static const auto breaks = makeBreaks();
    UErrorCode code = U_ZERO_ERROR;
    UText opened = UTEXT_INITIALIZER;
    utext_openUTF8(&opened, text.data(), static_cast<int64_t>(text.size()), &code);
    breaks->setText(&opened, code);
    require(code);
    Characters characters;
    int32_t start = 0;
    for (int32_t end = breaks->next(); end != icu::BreakIterator::DONE; end = breaks->next()) {
        characters.push_back(
            text.substr(static_cast<std::size_t>(start), static_cast<std::size_t>(end - start)));
        start = end;
    }
    utext_close(&opened);
    return characters;
}

int columnsOfCodePoint(gunichar character) {
    constexpr gunichar emojiPresentation = 0xFE0F; // makes a narrow sign before it a wide one
    return character == emojiPresentation     ? 1
           : g_unichar_iszerowidth(character) ? 0
           : g_unichar_iswide(character)      ? 2
                                              : 1;
}

/// How many of the characters fit, one after the other.
template <class Iterator>
std::size_t fitting(Iterator first, Iterator last, int columns) {
    std::size_t count = 0;
    for (; first != last && (columns -= columnsOf(*first)) >= 0; ++first) {
        ++count;
    }
    return count;
}

template <class Iterator>
std::string joined(Iterator first, Iterator last) {
    std::string text;
    for (; first != last; ++first) {
        text += *first;
    }
    return text;
}

bool runsFromRightToLeft(gunichar character) {
    const auto direction = u_charDirection(static_cast<UChar32>(character));
    return direction == U_RIGHT_TO_LEFT || direction == U_RIGHT_TO_LEFT_ARABIC;
}

/// `word` in pieces that fit, none empty.
std::vector<std::string> piecesOf(const std::string& word, int columns) {
    std::vector<std::string> pieces;
    const auto characters = charactersOf(word);
    for (auto at = characters.begin(); at != characters.end();) {
        const auto count = std::max<std::size_t>(fitting(at, characters.end(), columns), 1);
        const auto end = at + static_cast<std::ptrdiff_t>(count);
        pieces.push_back(joined(at, end));
        at = end;
    }
    return pieces;
}

std::vector<std::string> wordsOf(const std::string& text, int columns, LongWords longWords) {
    std::istringstream stream(text);
    std::vector<std::string> words;
    for (std::string word; stream >> word;) {
        if (longWords == LongWords::Broken && columnsOf(word) > columns) {
            const auto pieces = piecesOf(word, columns);
            words.insert(words.end(), pieces.begin(), pieces.end());
        } else {
            words.push_back(word);
        }
    }
    return words;
}

} // namespace

int columnsOf(std::string_view text) {
    int columns = 0;
    const char* const end = text.data() + text.size();
    for (const char* at = text.data(); at < end; at = g_utf8_next_char(at)) {
        columns += columnsOfCodePoint(g_utf8_get_char(at));
    }
    return columns;
}

std::string shortened(const std::string& text, int columns) {
    if (columnsOf(text) <= columns) {
        return text;
    }
    const auto characters = charactersOf(text);
    const auto count = fitting(characters.begin(), characters.end(), columns - 1);
    const auto end = characters.begin() + static_cast<std::ptrdiff_t>(count);
    return joined(characters.begin(), end).append(columns > 0 ? ellipsis : "");
}

std::string shortenedToEnd(const std::string& text, int columns) {
    if (columnsOf(text) <= columns) {
        return text;
    }
    const auto characters = charactersOf(text);
    const auto count = fitting(characters.rbegin(), characters.rend(), columns - 1);
    const auto first = characters.end() - static_cast<std::ptrdiff_t>(count);
    return std::string(columns > 0 ? ellipsis : "") + joined(first, characters.end());
}

std::string withoutLastCharacter(const std::string& text) {
    const auto characters = charactersOf(text);
    return characters.empty() ? text : text.substr(0, text.size() - characters.back().size());
}

std::string isolated(const std::string& text) {
    // NOLINTNEXTLINE(misc-misleading-bidirectional): the other one ends what it begins.
    constexpr std::string_view firstStrongIsolate = "\xE2\x81\xA8";
    constexpr std::string_view endOfIsolate = "\xE2\x81\xA9";
    const char* const end = text.data() + text.size();
    for (const char* at = text.data(); at < end; at = g_utf8_next_char(at)) {
        if (runsFromRightToLeft(g_utf8_get_char(at))) {
            return std::string(firstStrongIsolate).append(text).append(endOfIsolate);
        }
    }
    return text;
}

std::vector<std::string> wrapped(const std::string& text, int columns, const std::string& indent,
                                 LongWords longWords) {
    std::istringstream paragraphs(text);
    std::vector<std::string> lines;
    for (std::string paragraph; std::getline(paragraphs, paragraph);) {
        std::string line;
        for (const auto& word : wordsOf(paragraph, columns - columnsOf(indent), longWords)) {
            std::string longer = line.empty() ? indent : line + ' ';
            longer += word;
            if (!line.empty() && columnsOf(longer) > columns) {
                lines.push_back(line);
                longer = indent + word;
            }
            line.swap(longer);
        }
        lines.push_back(line);
    }
    return lines;
}

} // namespace quorl
