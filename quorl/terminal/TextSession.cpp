#include "quorl/terminal/TextSession.h"

#include <QCoreApplication>
#include <algorithm>
#include <array>
#include <iostream>

#include <unistd.h>

#include "quorl/terminal/PaneText.h"
#include "quorl/terminal/sheets/TerminalText.h"
#include "services/base/Utf8.h"
#include "services/language/Translated.h"

namespace quorl {

using language::filled;
using language::translated;

namespace {

constexpr int usualColumns = 80;
constexpr NSInteger linesBelow = 2; // of a page: a blank one, and which rows it has

void complain(const std::string& text) {
    std::cerr << "quorl: " << base::printable(text) << std::endl;
}

void append(std::vector<TextLine>& lines, const std::vector<TextLine>& more) {
    lines.insert(lines.end(), more.begin(), more.end());
}

bool isRewritten(const Sheet& sheet) { return sheet.form().kind == SheetForm::Kind::Rewritten; }

std::string quoted(const std::string& text) {
    constexpr int columns = 40;
    return filled(translated("“{name}”"),
                  {{"name", isolated(shortened(base::printable(text), columns))}});
}

std::string noSuchRow(NSInteger number, NSInteger count) {
    const auto wrong =
        filled(translated("There is no row {number}."), {{"number", std::to_string(number)}}) + ' ';
    return count == 0   ? wrong + translated("This page has no rows.")
           : count == 1 ? wrong + translated("There is row 1 alone.")
                        : wrong + filled(translated("There are rows 1 to {last}."),
                                         {{"last", std::to_string(count)}});
}

} // namespace

TextSession::TextSession(Companion& companion, int input, Sheet& sheet, LineEntry::Keys keys)
    : companion_(companion),
      input_(input),
      sheet_(sheet),
      notifier_(input, QSocketNotifier::Read),
      entry_(std::move(keys)) {
    listenToNotices();
    connect(&companion.screen(), &PaneScreen::drawing, this, &TextSession::show);
    connect(&notifier_, &QSocketNotifier::activated, this, &TextSession::readInput);
    if (isRewritten(sheet_)) {
        takeNextLineOnceShown(); // whoever types sees what there is
    } else {
        connect(&companion, &Companion::libraryRead, this, &TextSession::takeNextLineOnceShown,
                Qt::SingleShotConnection);
    }
}

void TextSession::listenToNotices() {
    Notices& notices = companion_.notices();
    if (isRewritten(sheet_)) {
        connect(&notices, &Notices::changed, &companion_.screen(), &PaneScreen::scheduleDrawing);
        return;
    }
    connect(&notices, &Notices::added, this, &complain);
    for (const std::string& text : notices.texts()) {
        complain(text);
    }
}

void TextSession::readInput() {
    std::array<char, 4096> buffer; // NOLINT(cppcoreguidelines-pro-type-member-init): read fills it
    const ssize_t length = read(input_, buffer.data(), buffer.size());
    if (length > 0) {
        entry_.take(std::string_view(buffer.data(), static_cast<std::size_t>(length)));
    } else if (length == 0 || (errno != EINTR && errno != EAGAIN)) {
        entry_.end();
    }
    notifier_.setEnabled(!entry_.isAtEnd());
    sheet_.setTyped(entry_.typed());
    if (!isWaiting_) {
        takeNextLine(); // at once: it was written by somebody who saw the rows of this moment
    }
}

/// Each line finds what the one before has led to.
void TextSession::takeNextLine() {
    isWaiting_ = false;
    if (const auto line = entry_.takeLine()) {
        take(*line);
        takeNextLineOnceShown();
    } else if (entry_.isAtEnd()) {
        QCoreApplication::quit();
    }
}

void TextSession::takeNextLineOnceShown() {
    isWaiting_ = true;
    companion_.screen().whenDrawn(*this, [this] {
        finder_ && finder_->isReading() ? takeNextLineOnceShown() : takeNextLine();
    });
}

void TextSession::take(const std::string& line) {
    sheet_.answer("");
    follow(commandIn(line), line);
    show();
}

void TextSession::follow(const TypedCommand& command, const std::string& line) {
    switch (command.kind) {
    case TypedCommand::Kind::Choose:
        return choose(command.number);
    case TypedCommand::Kind::GoBack:
        return goBack();
    case TypedCommand::Kind::Search:
        return search(command.words);
    case TypedCommand::Kind::EndSearch:
        return endSearch();
    case TypedCommand::Kind::NextPage:
        return turnPage(Direction::Forward);
    case TypedCommand::Kind::PreviousPage:
        return turnPage(Direction::Backward);
    case TypedCommand::Kind::ShowAgain:
        return sheet_.showAgain();
    case TypedCommand::Kind::Explain:
        return sheet_.answer(explanation());
    case TypedCommand::Kind::Leave:
        return leave();
    case TypedCommand::Kind::Unknown:
        sheet_.answer(filled(translated("{typed} is not understood."), {{"typed", quoted(line)}}) +
                      ' ' + howToGoOn(usualColumns));
    }
}

void TextSession::choose(NSInteger number) {
    const NSInteger count = content_ ? content_->rowCount() : 0;
    const NSInteger row = number - 1;
    if (row < 0 || row >= count) {
        sheet_.answer(noSuchRow(number, count));
    } else if (row >= shown_.first && row < shown_.end) {
        tap(row);
    } else {
        const auto lines = allLines(sheet_.form());
        const auto isRow = [row](const TextLine& line) { return line.row == row; };
        firstLine_ = std::find_if(lines.begin(), lines.end(), isRow) - lines.begin();
        const auto name = std::to_string(number);
        sheet_.answer(filled(translated("Row {number} was on another page. Type {number} again to "
                                        "choose it."),
                             {{"number", name}}));
    }
}

void TextSession::tap(NSInteger row) {
    if (!content_->tap(row)) {
        sheet_.answer(translated("The rows have just changed. Look again before you choose one."));
    }
}

void TextSession::goBack() {
    if (!words_.empty()) {
        endSearch();
    } else if (companion_.navigation().stack().size() > 1) {
        companion_.navigation().pop(false);
    } else {
        sheet_.answer(translated("There is no page before this one; q leaves."));
    }
}

void TextSession::search(const std::string& words) {
    if (finder_) {
        words_ = base::validUtf8(words);
        firstLine_ = 0;
        finder_->filter(QString::fromStdString(words_));
    }
}

void TextSession::endSearch() {
    if (words_.empty()) {
        sheet_.answer(
            translated("All rows are there. / and some words leave those with the words."));
        return;
    }
    words_.clear();
    finder_->endFilter();
    content_->showOnly(std::nullopt);
}

void TextSession::turnPage(Direction direction) {
    const NSInteger before = firstLine_;
    const NSInteger lines = std::max<NSInteger>(sheet_.form().lines - linesBelow, 1);
    firstLine_ += direction == Direction::Forward ? lines : -lines;
    show();
    if (firstLine_ == before) {
        sheet_.answer(direction == Direction::Forward ? translated("This is the last page.")
                                                      : translated("This is the first page."));
    }
}

void TextSession::leave() {
    entry_.close();
    QCoreApplication::quit();
}

void TextSession::showAgain() {
    show();
    sheet_.showAgain();
}

void TextSession::show() {
    takeTopPane();
    sheet_.show(page());
}

void TextSession::takeTopPane() {
    const auto top = companion_.navigation().top();
    if (!top || (content_ && &content_->pane() == top.get())) {
        return;
    }
    if (!words_.empty()) {
        endSearch(); // the pane may come back
    }
    firstLine_ = 0;
    finder_.reset();
    content_ = PaneContent::of(top, companion_.navigation());
    finder_ = std::make_unique<RowFinder>(*content_);
    connect(finder_.get(), &RowFinder::matchesChanged, this,
            [this](const std::vector<NSInteger>& rows) {
                content_->showOnly(rows);
                show(); // at once: no row may be tapped that is not shown
            });
}

std::vector<TextLine> TextSession::page() {
    const SheetForm form = sheet_.form();
    auto lines = allLines(form);
    cut(lines, form);
    shown_ = rowsOf(lines);
    if (shown_.first != std::exchange(firstDrawnRow_, shown_.first)) {
        lines = allLines(form);
        cut(lines, form);
    }
    return lines;
}

std::vector<TextLine> TextSession::allLines(const SheetForm& form) {
    std::vector<TextLine> lines;
    if (form.kind == SheetForm::Kind::Rewritten) {
        for (const auto& text : companion_.notices().texts()) {
            append(lines, paragraphs(text, form, ""));
            lines.emplace_back();
        }
    }
    append(lines, content_ ? linesOfPane(form) : paragraphs(companion_.problem(), form, ""));
    return lines;
}

std::vector<TextLine> TextSession::linesOfPane(const SheetForm& form) {
    const bool isReloaded = !content_->isCurrent();
    content_->draw(firstDrawnRow_, form.lines);
    if (isReloaded) {
        finder_->rowsDidChange();
    }
    auto lines = linesOf(*content_, form);
    const auto search = paragraphs(textOfSearch(), form, "");
    lines.insert(lines.begin() + 1, search.begin(), search.end());
    return lines;
}

std::string TextSession::textOfSearch() const {
    return words_.empty() ? std::string()
                          : filled(translated("{found} of {all} rows have {words} in their names; "
                                              "/ alone shows all."),
                                   {{"found", std::to_string(content_->rowCount())},
                                    {"all", std::to_string(content_->paneRowCount())},
                                    {"words", quoted(words_)}});
}

/// Leaves what fits from the first line of the page on, and says below it where that is.
void TextSession::cut(std::vector<TextLine>& lines, const SheetForm& form) {
    const auto count = static_cast<NSInteger>(lines.size());
    const NSInteger room =
        count <= form.lines ? count : std::max<NSInteger>(form.lines - linesBelow, 1);
    firstLine_ = std::clamp<NSInteger>(firstLine_, 0, count - room);
    lines.erase(lines.begin() + firstLine_ + room, lines.end());
    lines.erase(lines.begin(), lines.begin() + firstLine_);
    if (room < count && form.lines > linesBelow) {
        lines.emplace_back();
        lines.push_back({textOfPlace(rowsOf(lines))});
    }
}

std::string TextSession::textOfPlace(const RowRange& rows) const {
    const auto turning = translated("+ shows what comes after, - what comes before.");
    return rows.first == rows.end
               ? turning
               : filled(translated("Rows {first} to {last} of {count}: {turning}"),
                        {{"first", std::to_string(rows.first + 1)},
                         {"last", std::to_string(rows.end)},
                         {"count", std::to_string(content_->rowCount())},
                         {"turning", turning}});
}

TextSession::RowRange TextSession::rowsOf(const std::vector<TextLine>& lines) {
    RowRange rows;
    for (const auto& line : lines) {
        if (line.row) {
            rows = {rows.end == 0 ? *line.row : rows.first, *line.row + 1};
        }
    }
    return rows;
}

} // namespace quorl
