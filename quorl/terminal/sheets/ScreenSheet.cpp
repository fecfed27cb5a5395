#include "quorl/terminal/sheets/ScreenSheet.h"

#include <algorithm>

#include "quorl/terminal/TypedCommand.h"
#include "quorl/terminal/sheets/TerminalText.h"
#include "services/base/Utf8.h"

namespace quorl {

namespace {

constexpr int headLines = 2;  // how to go on, and a blank line
constexpr int leastLines = 2; // of a page beside a long answer
constexpr const char* prompt = "> ";

} // namespace

ScreenSheet::ScreenSheet(Terminal& terminal) : terminal_(terminal) {
    terminal_.enter();
    paint();
}

SheetForm ScreenSheet::form() const {
    const auto [columns, lines] = terminal_.size();
    const int others = headLines + static_cast<int>(linesOfAnswer().size()) + 1;
    return {columns, std::max(lines - others, 1), SheetForm::Kind::Rewritten};
}

void ScreenSheet::show(const std::vector<TextLine>& page) {
    page_ = page;
    paint();
}

void ScreenSheet::showAgain() {
    terminal_.enter();
    terminal_.clear();
    painted_.clear();
    paint();
}

void ScreenSheet::answer(const std::string& text) {
    answer_ = text;
    paint();
}

void ScreenSheet::setTyped(const std::string& text) {
    typed_ = base::printable(text);
    paint();
}

void ScreenSheet::paint() {
    const auto now = lines();
    painted_.resize(now.size());
    for (std::size_t at = 0; at < now.size(); ++at) {
        if (now[at] != painted_[at]) {
            terminal_.write(static_cast<int>(at), now[at]);
        }
    }
    painted_ = now;
    terminal_.show(static_cast<int>(now.size()) - 1, columnsOf(now.back()));
}

/// As many as the terminal has.
std::vector<std::string> ScreenSheet::lines() const {
    const auto [columns, count] = terminal_.size();
    std::vector<std::string> lines{howToGoOn(columns), ""};
    for (const auto& line : page_) {
        lines.push_back(line.text);
    }
    auto end = linesOfAnswer();
    end.push_back(prompt + shownOfTyped());
    const auto shown = std::min(count, static_cast<int>(end.size()));
    lines.resize(static_cast<std::size_t>(count - shown));
    lines.insert(lines.end(), end.end() - shown, end.end());
    for (auto& line : lines) {
        line = shortened(line, columns);
    }
    return lines;
}

std::vector<std::string> ScreenSheet::linesOfAnswer() const {
    const auto [columns, count] = terminal_.size();
    auto lines = wrapped(answer_, columns, "", LongWords::Broken);
    const auto room = static_cast<std::size_t>(std::max(count - headLines - leastLines - 1, 0));
    if (lines.size() > room) {
        lines.resize(room);
    }
    return lines;
}

/// The end of it, with a column left for the cursor.
std::string ScreenSheet::shownOfTyped() const {
    return shortenedToEnd(typed_, terminal_.size().width - columnsOf(prompt) - 1);
}

} // namespace quorl
