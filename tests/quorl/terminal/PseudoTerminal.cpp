#include "tests/quorl/terminal/PseudoTerminal.h"

#include <array>
#include <csignal>
#include <stdexcept>
#include <system_error>

#include <fcntl.h>
#include <poll.h>
#include <pty.h>
#include <sys/ioctl.h>
#include <sys/wait.h>
#include <termios.h>

namespace quorl::tests {

namespace {

constexpr int patience = 60'000; // milliseconds

std::vector<std::string> environmentWith(const Environment& changes) {
    auto environment = QProcessEnvironment::systemEnvironment();
    environment.remove(QStringLiteral("LANGUAGE"));
    environment.insert(QStringLiteral("LANG"), QStringLiteral("C.UTF-8"));
    environment.insert(QStringLiteral("TERM"), QStringLiteral("xterm-256color"));
    for (const auto& [name, value] : changes) {
        value.empty()
            ? environment.remove(QString::fromStdString(name))
            : environment.insert(QString::fromStdString(name), QString::fromStdString(value));
    }
    std::vector<std::string> variables;
    for (const auto& variable : environment.toStringList()) {
        variables.push_back(variable.toStdString());
    }
    return variables;
}

/// As `exec` takes them; `texts` outlive the pointers.
std::vector<char*> pointersTo(std::vector<std::string>& texts) {
    std::vector<char*> pointers;
    for (auto& text : texts) {
        pointers.push_back(text.data());
    }
    pointers.push_back(nullptr);
    return pointers;
}

winsize windowOf(PseudoTerminal::Size size) {
    winsize window{};
    window.ws_col = static_cast<unsigned short>(size.columns);
    window.ws_row = static_cast<unsigned short>(size.lines);
    return window;
}

} // namespace

PseudoTerminal::PseudoTerminal(const std::vector<std::string>& command, Size size,
                               const Environment& environment)
    : size_(size),
      emulator_(vterm_new(size.lines, size.columns), &vterm_free),
      screen_(vterm_obtain_screen(emulator_.get())) {
    vterm_set_utf8(emulator_.get(), 1);
    vterm_screen_enable_altscreen(screen_, 1);
    vterm_screen_reset(screen_, 1);
    auto words = command;
    auto variables = environmentWith(environment);
    const auto wordPointers = pointersTo(words);
    const auto variablePointers = pointersTo(variables);
    const winsize window = windowOf(size);
    int master = -1;
    process_ = forkpty(&master, nullptr, nullptr, &window);
    if (process_ == 0) {
        execvpe(wordPointers.front(), wordPointers.data(), variablePointers.data());
        _exit(127);
    }
    if (process_ < 0) {
        throw std::system_error(errno, std::generic_category(), "forkpty");
    }
    master_ = base::FileDescriptor(master);
}

PseudoTerminal::~PseudoTerminal() {
    if (process_ > 0) {
        ::kill(process_, SIGKILL);
        waitpid(process_, nullptr, 0);
    }
}

void PseudoTerminal::type(const std::string& bytes) {
    if (write(master_.get(), bytes.data(), bytes.size()) != static_cast<ssize_t>(bytes.size())) {
        throw std::system_error(errno, std::generic_category(), "typing");
    }
}

void PseudoTerminal::signal(int number) const { ::kill(process_, number); }

void PseudoTerminal::resize(Size size) {
    size_ = size;
    vterm_set_size(emulator_.get(), size.lines, size.columns);
    const winsize window = windowOf(size);
    if (ioctl(master_.get(), TIOCSWINSZ, &window) != 0) {
        throw std::system_error(errno, std::generic_category(), "TIOCSWINSZ");
    }
}

bool PseudoTerminal::readMore() {
    pollfd readable{master_.get(), POLLIN, 0};
    if (poll(&readable, 1, patience) != 1) {
        throw std::runtime_error("Nothing new in the terminal, which shows:\n" + screen());
    }
    std::array<char, 4096> buffer{};
    const ssize_t length = read(master_.get(), buffer.data(), buffer.size());
    if (length <= 0) {
        return false;
    }
    vterm_input_write(emulator_.get(), buffer.data(), static_cast<std::size_t>(length));
    written_.append(buffer.data(), static_cast<std::size_t>(length));
    return true;
}

void PseudoTerminal::waitFor(const std::string& text) {
    while (screen().find(text) == std::string::npos) {
        if (!readMore()) {
            throw std::runtime_error("\"" + text + "\" was never in the terminal:\n" + screen());
        }
    }
}

void PseudoTerminal::waitUntilGone(const std::string& text) {
    while (screen().find(text) != std::string::npos) {
        if (!readMore()) {
            throw std::runtime_error("\"" + text + "\" stays in the terminal:\n" + screen());
        }
    }
}

void PseudoTerminal::waitForEnding(const std::string& written) {
    while (!written_.ends_with(written)) {
        if (!readMore()) {
            throw std::runtime_error("The terminal never ended with \"" + written + "\":\n" +
                                     written_);
        }
    }
}

std::vector<std::string> PseudoTerminal::lines() const {
    constexpr std::size_t bytesToCell = 32;
    std::vector<std::string> lines;
    for (int line = 0; line < size_.lines; ++line) {
        std::string text(static_cast<std::size_t>(size_.columns) * bytesToCell, '\0');
        text.resize(vterm_screen_get_text(screen_, text.data(), text.size(),
                                          {line, line + 1, 0, size_.columns}));
        text.erase(text.find_last_not_of(' ') + 1);
        lines.push_back(text);
    }
    return lines;
}

std::string PseudoTerminal::screen() const {
    std::string text;
    for (const auto& line : lines()) {
        text += line + '\n';
    }
    return text;
}

std::string PseudoTerminal::lineWith(const std::string& text) const {
    for (const auto& line : lines()) {
        if (line.find(text) != std::string::npos) {
            return line;
        }
    }
    return {};
}

int PseudoTerminal::cursorColumn() const {
    VTermPos position{};
    vterm_state_get_cursorpos(vterm_obtain_state(emulator_.get()), &position);
    return position.col;
}

bool PseudoTerminal::hasUsualMode() const {
    termios mode{};
    return tcgetattr(master_.get(), &mode) == 0 && (mode.c_lflag & ICANON) != 0 &&
           (mode.c_lflag & ECHO) != 0;
}

std::string PseudoTerminal::takeWritten() { return std::exchange(written_, {}); }

int PseudoTerminal::end() {
    while (readMore()) {
    }
    int status = 0;
    waitpid(std::exchange(process_, -1), &status, 0);
    return status;
}

} // namespace quorl::tests
