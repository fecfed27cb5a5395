#include "quorl/terminal/TerminalMode.h"

#include <QCoreApplication>
#include <iostream>

#include <unistd.h>

#include "quorl/process/QtSetup.h"
#include "quorl/terminal/SignalWatch.h"
#include "quorl/terminal/TextScreen.h"
#include "quorl/terminal/TextSession.h"
#include "quorl/terminal/sheets/PrintedSheet.h"
#include "quorl/terminal/sheets/ScreenSheet.h"

namespace quorl {

namespace {

/// What else goes on in a terminal, while the session is there.
using Accompany = std::function<void(TextSession&)>;

ExitCode show(const Places& places, Sheet& sheet, LineEntry::Keys keys,
              const Accompany& accompany) {
    TextScreen screen;
    Notices notices;
    Companion companion(places, screen, notices);
    TextSession session(companion, STDIN_FILENO, sheet, std::move(keys));
    accompany(session);
    companion.startTrialEngine();
    companion.start();
    return static_cast<ExitCode>(QCoreApplication::exec());
}

LineEntry::Keys usualKeys() {
    LineEntry::Keys keys{{Terminal::key("knp"), "+"}, {Terminal::key("kpp"), "-"}, {"\f", ""}};
    keys.erase(""); // of a terminal without such a key
    return keys;
}

/// The signal that ended it is given back too; null for none.
std::pair<ExitCode, std::optional<int>> showOn(Terminal& terminal, const Places& places) {
    SignalWatch signals;
    ScreenSheet sheet(terminal);
    std::optional<int> signal;
    const auto code = show(places, sheet, usualKeys(), [&](TextSession& session) {
        QObject::connect(&signals, &SignalWatch::ending, &session, [&](int number) {
            signal = number;
            QCoreApplication::quit();
        });
        QObject::connect(&signals, &SignalWatch::stopping, &session, [&] {
            terminal.leave();
            SignalWatch::stop();
        });
        QObject::connect(&signals, &SignalWatch::goingOn, &session, [&] {
            terminal.leave(); // a shell may have had it meanwhile
            session.showAgain();
        });
        QObject::connect(&signals, &SignalWatch::resized, &session, &TextSession::showAgain);
    });
    terminal.leave();
    return {code, signal};
}

} // namespace

ExitCode runInTerminal(char* program, const Places& places) {
    QtSetup setup(program);
    const QCoreApplication application(setup.argumentCount(), setup.arguments());
    if (const auto terminal = Terminal::ofProcess()) {
        const auto [code, signal] = showOn(*terminal, places);
        if (signal) {
            SignalWatch::end(*signal);
        }
        return code;
    }
    PrintedSheet sheet(std::cout, STDOUT_FILENO);
    return show(places, sheet, {}, [](TextSession& /*session*/) {});
}

} // namespace quorl
