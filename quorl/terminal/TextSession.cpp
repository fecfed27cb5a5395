#include "quorl/terminal/TextSession.h"

#include <QCoreApplication>
#include <array>
#include <charconv>
#include <iostream>
#include <sstream>

#include <sys/ioctl.h>
#include <unistd.h>

#include "quorl/terminal/PaneText.h"
#include "services/base/Utf8.h"

namespace quorl {

namespace {

constexpr int usualWidth = 80;
constexpr NSInteger rowsOnScreen = 200;
constexpr const char* hint = "A number taps the row, b goes back, q leaves.\n";
constexpr const char* unseen = "The rows have just changed. Look again before you tap one.\n";

int terminalWidth() {
    winsize size{};
    const bool isTerminal = ioctl(STDOUT_FILENO, TIOCGWINSZ, &size) == 0 && size.ws_col > 0;
    return isTerminal ? size.ws_col : usualWidth;
}

std::optional<NSInteger> numberIn(const std::string& text) {
    NSInteger number = 0;
    const char* end = text.data() + text.size();
    const auto parsed = std::from_chars(text.data(), end, number);
    return parsed.ec == std::errc() && parsed.ptr == end ? std::optional(number) : std::nullopt;
}

std::string textOfProblem(const std::string& problem, int width) {
    std::istringstream lines(problem);
    std::string text;
    for (std::string line; std::getline(lines, line);) {
        text += line.empty() ? "\n" : wrapped(base::printable(line), width, "");
    }
    return text;
}

void complain(const std::string& text) {
    std::cerr << "quorl: " << base::printable(text) << std::endl;
}

} // namespace

TextSession::TextSession(Companion& companion, int input, std::ostream& output)
    : companion_(companion),
      input_(input),
      output_(output),
      notifier_(input, QSocketNotifier::Read) {
    notifier_.setEnabled(false);
    connect(&companion, &Companion::libraryRead, this, &TextSession::readOnceDrawn,
            Qt::SingleShotConnection);
    connect(&companion.notices(), &Notices::added, this, &complain);
    for (const std::string& text : companion.notices().texts()) {
        complain(text);
    }
    connect(&companion.screen(), &PaneScreen::drawing, this, &TextSession::show);
    connect(&notifier_, &QSocketNotifier::activated, this, &TextSession::readInput);
}

void TextSession::readOnceDrawn() {
    companion_.screen().whenDrawn(*this, [this] { notifier_.setEnabled(true); });
}

void TextSession::readInput() {
    std::array<char, 4096> buffer; // NOLINT(cppcoreguidelines-pro-type-member-init): read fills it
    const ssize_t length = read(input_, buffer.data(), buffer.size());
    if (length > 0) {
        unread_.append(buffer.data(), static_cast<std::size_t>(length));
    } else if (length == 0 || (errno != EINTR && errno != EAGAIN)) {
        isAtEnd_ = true;
        notifier_.setEnabled(false);
    }
    if (!isWaiting_) {
        takeNextLine(); // at once: it was written by somebody who saw the rows of this moment
    }
}

/// Each line finds what the one before has led to.
void TextSession::takeNextLine() {
    if (isAtEnd_ && !unread_.empty() && unread_.back() != '\n') {
        unread_ += '\n';
    }
    const auto end = unread_.find('\n');
    if (end != std::string::npos) {
        const std::string command(base::trimmed(unread_.substr(0, end)));
        unread_.erase(0, end + 1);
        take(command);
        isWaiting_ = true;
        companion_.screen().whenDrawn(*this, [this] {
            isWaiting_ = false;
            takeNextLine();
        });
    } else if (isAtEnd_) {
        QCoreApplication::quit();
    }
}

void TextSession::take(const std::string& command) {
    if (command == "q") {
        unread_.clear();
        QCoreApplication::quit();
    } else if (command == "b" && companion_.navigation().stack().size() > 1) {
        companion_.navigation().pop(false);
        firstRow_ = 0;
        show();
    } else if (command == "+" || command == "-") {
        scroll(command == "+" ? rowsOnScreen : -rowsOnScreen);
    } else if (const auto number = numberIn(command);
               number && *number > 0 && content_ && content_->cell(*number - 1)) {
        tap(*number - 1);
    } else {
        print(hint);
    }
}

void TextSession::tap(NSInteger row) {
    const auto* pane = companion_.navigation().top().get();
    if (!content_->tap(row)) {
        print(unseen); // and the drawing that is due prints the rows
        return;
    }
    if (pane != companion_.navigation().top().get()) {
        firstRow_ = 0;
    }
    show();
}

void TextSession::scroll(NSInteger rows) {
    const NSInteger count = content_ ? content_->rowCount() : 0;
    firstRow_ = std::clamp<NSInteger>(firstRow_ + rows, 0, std::max<NSInteger>(count - 1, 0));
    show();
}

void TextSession::show() {
    const auto top = companion_.navigation().top();
    if (top && (!content_ || &content_->pane() != top.get())) {
        content_ = PaneContent::of(top, companion_.navigation());
    }
    if (top) {
        content_->draw(firstRow_, rowsOnScreen);
    }
    const auto text = top ? textOf(*content_, terminalWidth())
                          : textOfProblem(companion_.problem(), terminalWidth());
    if (text != shown_) {
        shown_ = text;
        print(text + '\n');
    }
}

void TextSession::print(const std::string& text) { output_ << text << std::flush; }

} // namespace quorl
