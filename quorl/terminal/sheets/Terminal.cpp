#include "quorl/terminal/sheets/Terminal.h"

#include <array>
#include <cstdio>
#include <optional>
#include <utility>

#define NCURSES_NOMACROS
#include <curses.h>
#include <sys/ioctl.h>
#include <term.h>
#include <unistd.h>

namespace quorl {

namespace {

/// Of the database, by its name there; nothing where the terminal cannot do that.
std::optional<std::string> capability(const char* name) {
    std::array<char, 16> copy{}; // the library asks for a text that may be written to
    std::snprintf(copy.data(), copy.size(), "%s", name);
    const char* const found = tigetstr(copy.data());
    constexpr std::intptr_t noText = -1;
    return !found || reinterpret_cast<std::intptr_t>(found) == noText ? std::nullopt
                                                                      : std::optional(found);
}

/// With the pauses that slow terminals want.
void send(const std::string& sequence) { tputs(sequence.c_str(), 1, putchar); }

void sendIfThere(const char* name) {
    if (const auto sequence = capability(name)) {
        send(*sequence);
    }
}

void moveTo(int line, int column) { send(tiparm(capability("cup")->c_str(), line, column)); }

bool canBeWrittenAnywhere() {
    int problem = 0;
    return setupterm(nullptr, STDOUT_FILENO, &problem) == OK && capability("cup") &&
           capability("el") && capability("clear");
}

} // namespace

std::unique_ptr<Terminal> Terminal::ofProcess() {
    termios before{};
    const bool isTerminal = isatty(STDOUT_FILENO) != 0 && tcgetattr(STDIN_FILENO, &before) == 0;
    return isTerminal && canBeWrittenAnywhere() ? std::unique_ptr<Terminal>(new Terminal(before))
                                                : nullptr;
}

Terminal::~Terminal() { leave(); }

void Terminal::enter() {
    if (std::exchange(isEntered_, true)) {
        return;
    }
    termios mode = before_;
    mode.c_lflag &= ~static_cast<tcflag_t>(ICANON | ECHO);
    mode.c_cc[VMIN] = 1;
    mode.c_cc[VTIME] = 0;
    errors_.hold();
    tcsetattr(STDIN_FILENO, TCSADRAIN, &mode); // what has been typed already is kept
    sendIfThere("smcup");
    sendIfThere("rmam");
    clear();
}

void Terminal::leave() {
    if (!std::exchange(isEntered_, false)) {
        return;
    }
    moveTo(size().height - 1, 0);
    send(*capability("el"));
    sendIfThere("smam");
    sendIfThere("rmcup");
    std::fflush(stdout);
    tcsetattr(STDIN_FILENO, TCSADRAIN, &before_);
    errors_.release();
}

Terminal::Size Terminal::size() const {
    constexpr int usualColumns = 80;
    constexpr int usualLines = 24;
    winsize size{};
    const bool isKnown = ioctl(STDOUT_FILENO, TIOCGWINSZ, &size) == 0;
    return {isKnown && size.ws_col > 0 ? size.ws_col : usualColumns,
            isKnown && size.ws_row > 0 ? size.ws_row : usualLines};
}

void Terminal::clear() { send(*capability("clear")); }

/// Erased first: a cursor in the last column would erase what is there.
void Terminal::write(int line, const std::string& text) {
    moveTo(line, 0);
    send(*capability("el"));
    std::fputs(text.c_str(), stdout);
}

void Terminal::show(int line, int column) {
    moveTo(line, column);
    std::fflush(stdout);
}

std::string Terminal::key(const char* name) { return capability(name).value_or(""); }

} // namespace quorl
