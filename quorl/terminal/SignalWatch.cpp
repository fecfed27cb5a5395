#include "quorl/terminal/SignalWatch.h"

#include <array>
#include <cerrno>
#include <csignal>
#include <cstdlib>
#include <system_error>

#include <fcntl.h>
#include <unistd.h>

namespace quorl {

namespace {

constexpr std::array endingSignals{SIGINT, SIGTERM, SIGHUP};
constexpr std::array otherSignals{SIGTSTP, SIGCONT, SIGWINCH};

/// Where the handler writes: it can reach nothing else.
volatile sig_atomic_t toWatch = -1;

void handle(int number) {
    const int errorBefore = errno;
    const auto byte = static_cast<unsigned char>(number);
    const ssize_t written = write(toWatch, &byte, 1);
    static_cast<void>(written); // a full pipe holds what is to be done already
    errno = errorBefore;
}

void setHandler(int number, void (*handler)(int), int flags) {
    struct sigaction action {};

    struct sigaction before {};

    sigaction(number, nullptr, &before);
    if (before.sa_handler != SIG_IGN) {
        action.sa_handler = handler;
        action.sa_flags = flags;
        sigaction(number, &action, nullptr);
    }
}

} // namespace

SignalWatch::SignalWatch() {
    std::array<int, 2> ends{};
    if (pipe2(ends.data(), O_CLOEXEC | O_NONBLOCK) != 0) {
        throw std::system_error(errno, std::generic_category(), "Signals cannot be taken");
    }
    caught_ = base::FileDescriptor(ends[0]);
    toWatch = ends[1];
    notifier_ = std::make_unique<QSocketNotifier>(caught_.get(), QSocketNotifier::Read);
    connect(notifier_.get(), &QSocketNotifier::activated, this, &SignalWatch::take);
    for (const int number : endingSignals) {
        setHandler(number, handle, SA_RESTART | static_cast<int>(SA_RESETHAND));
    }
    for (const int number : otherSignals) {
        setHandler(number, handle, SA_RESTART);
    }
}

SignalWatch::~SignalWatch() {
    for (const int number : endingSignals) {
        setHandler(number, SIG_DFL, 0);
    }
    for (const int number : otherSignals) {
        setHandler(number, SIG_DFL, 0);
    }
    close(toWatch);
}

void SignalWatch::take() {
    unsigned char number = 0;
    while (read(caught_.get(), &number, 1) == 1) {
        if (number == SIGTSTP) {
            Q_EMIT stopping();
        } else if (number == SIGCONT) {
            Q_EMIT goingOn();
        } else if (number == SIGWINCH) {
            Q_EMIT resized();
        } else {
            Q_EMIT ending(number);
        }
    }
}

void SignalWatch::stop() {
    setHandler(SIGTSTP, SIG_DFL, 0);
    static_cast<void>(raise(SIGTSTP));
    setHandler(SIGTSTP, handle, SA_RESTART);
}

void SignalWatch::end(int number) {
    static_cast<void>(raise(number));
    std::_Exit(128 + number); // a shell's word for the same, where the signal is held back
}

} // namespace quorl
