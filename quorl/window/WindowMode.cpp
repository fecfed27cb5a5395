#include "quorl/window/WindowMode.h"

#include <QApplication>
#include <QIcon>
#include <QScreen>
#include <iostream>

#include "quorl/process/QtSetup.h"
#include "quorl/window/MainWindow.h"
#include "quorl/window/desktop/DesktopLook.h"
#include "quorl/window/desktop/OneApp.h"
#include "quorl/window/desktop/WindowMemory.h"
#include "quorl/window/frame/WindowFrame.h"

namespace quorl {

namespace {

/// An empty text says nothing.
void tell(const QString& problem) {
    if (!problem.isEmpty()) {
        std::cerr << "quorl: " << problem.toStdString() << '\n';
    }
}

/// What another app that has taken the start over, or has not, makes of this one.
ExitCode endWith(const QString& problem) {
    tell(problem);
    return problem.isEmpty() ? ExitCode::Success : ExitCode::Failure;
}

/// On Wayland it is the one of the desktop entry, and nothing is loaded that draws it.
void setIcon() {
    if (QGuiApplication::platformName() == QStringLiteral("xcb")) {
        QApplication::setWindowIcon(QIcon(QStringLiteral(":/org.quorl.Velora.svg")));
    }
}

/// Until the user closes it.
ExitCode showWindow(OneApp& app, const Places& places) {
    WindowScreen screen;
    const DesktopLook look(QDBusConnection::sessionBus(), screen);
    Notices notices;
    Companion companion(places, screen, notices);
    MainWindow window(companion, screen);
    if (isFrameLeftToApps(QGuiApplication::platformName(),
                          qEnvironmentVariable("XDG_CURRENT_DESKTOP"))) {
        window.takeFrame();
    }
    const WindowMemory memory = WindowMemory::of(places.purpose());
    window.resize(memory.size(window.screen()->availableSize()));
    app.setTake([&](const Start& other) {
        window.comeForward(other.token);
        return QString::fromStdString(companion.take(other.places));
    });
    companion.startTrialEngine();
    companion.start();
    if (const auto panes = memory.panes()) {
        companion.reopen(*panes);
    }
    window.show();
    const auto code = static_cast<ExitCode>(QApplication::exec());
    tell(memory.keep({window.normalGeometry().size(), companion.openPanes()}));
    return code;
}

} // namespace

ExitCode runInWindow(char* program, const Places& places) {
    if (const auto problem = QtSetup::displayProblem(); !problem.empty()) {
        tell(QString::fromStdString(problem));
        return ExitCode::Failure;
    }
    const Start start = Start::with(places);
    QtSetup setup(program);
    const QApplication application(setup.argumentCount(), setup.arguments());
    QtSetup::followUsersLanguage();
    setIcon();
    OneApp app(QDBusConnection::sessionBus(), places.purpose());
    if (const auto problem = app.handOver(start)) {
        return endWith(*problem);
    }
    return showWindow(app, places);
}

} // namespace quorl
