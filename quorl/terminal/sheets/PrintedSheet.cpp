#include "quorl/terminal/sheets/PrintedSheet.h"

#include <algorithm>
#include <ostream>

#include <sys/ioctl.h>

#include "quorl/terminal/TypedCommand.h"
#include "quorl/terminal/sheets/TerminalText.h"

namespace quorl {

namespace {

constexpr int usualColumns = 80;
constexpr int linesWithoutTerminal = 200;
constexpr int linesAround = 3; // a page ends with a blank line, then comes what is typed

/// Whether the pages are one page with other words in it.
bool haveOneShape(const std::vector<TextLine>& one, const std::vector<TextLine>& other) {
    const auto isAlike = [](const TextLine& line, const TextLine& now) {
        return line.row == now.row && line.goesOn == now.goesOn;
    };
    return !one.empty() && !other.empty() && one.front().text == other.front().text &&
           std::equal(one.begin(), one.end(), other.begin(), other.end(), isAlike);
}

} // namespace

PrintedSheet::PrintedSheet(std::ostream& output, int terminal)
    : output_(output), terminal_(terminal) {
    output_ << howToGoOn(form().columns) << "\n\n" << std::flush;
}

SheetForm PrintedSheet::form() const {
    winsize size{};
    const bool isTerminal = ioctl(terminal_, TIOCGWINSZ, &size) == 0 && size.ws_col > 0;
    return isTerminal ? SheetForm{size.ws_col, std::max(size.ws_row - linesAround, 1),
                                  SheetForm::Kind::Printed}
                      : SheetForm{usualColumns, linesWithoutTerminal, SheetForm::Kind::Printed};
}

void PrintedSheet::show(const std::vector<TextLine>& page) {
    if (haveOneShape(shown_, page)) {
        printChanges(page);
        shown_ = page;
    } else {
        shown_ = page;
        showAgain();
    }
}

/// A paragraph is printed whole.
void PrintedSheet::printChanges(const std::vector<TextLine>& page) {
    for (std::size_t first = 0; first < page.size();) {
        std::size_t end = first + 1;
        while (end < page.size() && page[end].goesOn) {
            ++end;
        }
        bool isChanged = false;
        for (std::size_t at = first; at < end; ++at) {
            isChanged = isChanged || page[at].text != shown_[at].text;
        }
        for (; first < end; ++first) {
            output_ << (isChanged ? page[first].text + '\n' : std::string());
        }
    }
    output_ << std::flush;
}

void PrintedSheet::showAgain() {
    for (const auto& line : shown_) {
        output_ << line.text << '\n';
    }
    output_ << '\n' << std::flush;
}

void PrintedSheet::answer(const std::string& text) {
    for (const auto& line : wrapped(text, form().columns, "", LongWords::Whole)) {
        output_ << line << '\n';
    }
    output_ << std::flush;
}

} // namespace quorl
