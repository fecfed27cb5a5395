#include "quorl/terminal/TerminalMode.h"

#include <QCoreApplication>
#include <iostream>

#include <unistd.h>

#include "quorl/process/QtSetup.h"
#include "quorl/terminal/TextScreen.h"
#include "quorl/terminal/TextSession.h"

namespace quorl {

ExitCode runInTerminal(char* program, const Places& places) {
    QtSetup setup(program);
    const QCoreApplication application(setup.argumentCount(), setup.arguments());
    TextScreen screen;
    Notices notices;
    Companion companion(places, screen, notices);
    const TextSession session(companion, STDIN_FILENO, std::cout);
    companion.startTrialEngine();
    companion.start();
    return static_cast<ExitCode>(QCoreApplication::exec());
}

} // namespace quorl
