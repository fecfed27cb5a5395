#include "quorl/window/WindowMode.h"

#include <QApplication>
#include <iostream>

#include "quorl/app/QtSetup.h"
#include "quorl/window/MainWindow.h"

namespace quorl {

namespace {

constexpr QSize usualSize(400, 720);

} // namespace

ExitCode runInWindow(char* program, const Places& places) {
    if (!QtSetup::hasDisplay()) {
        std::cerr << "quorl: There is no display here. Start quorl in a graphical session, or with "
                     "--text.\n";
        return ExitCode::Failure;
    }
    QtSetup setup(program);
    const QApplication application(setup.argumentCount(), setup.arguments());
    QtSetup::followUsersLanguage();
    WindowScreen screen;
    Notices notices;
    Companion companion(places, screen, notices);
    MainWindow window(companion, screen);
    window.resize(usualSize);
    companion.startTrialEngine();
    companion.start();
    window.show();
    return static_cast<ExitCode>(QApplication::exec());
}

} // namespace quorl
