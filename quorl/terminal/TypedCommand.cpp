#include "quorl/terminal/TypedCommand.h"

#include <algorithm>
#include <charconv>
#include <limits>
#include <map>
#include <optional>

#include "quorl/terminal/sheets/TerminalText.h"
#include "services/language/Translated.h"

namespace quorl {

using language::translated;

namespace {

using Kind = TypedCommand::Kind;

/// A number that is too large for any row is the largest.
std::optional<NSInteger> numberIn(const std::string& text) {
    NSInteger number = 0;
    const char* end = text.data() + text.size();
    const auto parsed = std::from_chars(text.data(), end, number);
    if (text.starts_with('-') || parsed.ptr != end || parsed.ec == std::errc::invalid_argument) {
        return std::nullopt;
    }
    return parsed.ec == std::errc() ? number : std::numeric_limits<NSInteger>::max();
}

} // namespace

TypedCommand commandIn(const std::string& line) {
    static const std::map<std::string, Kind> words{{"b", Kind::GoBack},   {"/", Kind::EndSearch},
                                                   {"+", Kind::NextPage}, {"-", Kind::PreviousPage},
                                                   {"", Kind::ShowAgain}, {"?", Kind::Explain},
                                                   {"q", Kind::Leave}};
    if (const auto found = words.find(line); found != words.end()) {
        return {found->second};
    }
    if (const auto number = numberIn(line)) {
        return {Kind::Choose, *number};
    }
    return line.starts_with('/') ? TypedCommand{Kind::Search, 0, line.substr(1)}
                                 : TypedCommand{Kind::Unknown};
}

std::string howToGoOn(int columns) {
    const auto overview = translated(
        "A number chooses, b goes back, / searches, + - turn pages, ? explains, q leaves.");
    return columnsOf(overview) <= columns ? overview : translated("? explains, q leaves");
}

std::string explanation() {
    return translated("A number chooses the row that begins with it: it opens a page, turns a "
                      "switch, or picks what the row offers.\n"
                      "b goes back to the page before, or ends a search.\n"
                      "/words leaves the rows with these words in their names; / alone shows all "
                      "again.\n"
                      "+ and - turn the pages of what is too long for the terminal.\n"
                      "Enter alone shows the page again.\n"
                      "? shows this, q leaves.\n");
}

} // namespace quorl
