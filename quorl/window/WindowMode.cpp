#include "quorl/window/WindowMode.h"

#include <QApplication>
#include <iostream>

#include "quorl/app/QtSetup.h"
#include "quorl/window/MainWindow.h"
#include "quorl/window/desktop/OneApp.h"

namespace quorl {

namespace {

constexpr QSize usualSize(400, 720);

/// What another app that has taken the start over, or has not, makes of this one.
ExitCode endWith(const QString& problem) {
    if (problem.isEmpty()) {
        return ExitCode::Success;
    }
    std::cerr << "quorl: " << problem.toStdString() << '\n';
    return ExitCode::Failure;
}

} // namespace

ExitCode runInWindow(char* program, const Places& places) {
    if (!QtSetup::hasDisplay()) {
        std::cerr << "quorl: There is no display here. Start quorl in a graphical session, or with "
                     "--text.\n";
        return ExitCode::Failure;
    }
    const Start start = Start::with(places);
    QtSetup setup(program);
    const QApplication application(setup.argumentCount(), setup.arguments());
    QtSetup::followUsersLanguage();
    OneApp app(QDBusConnection::sessionBus(), places.purpose());
    if (const auto problem = app.handOver(start)) {
        return endWith(*problem);
    }
    WindowScreen screen;
    Notices notices;
    Companion companion(places, screen, notices);
    MainWindow window(companion, screen);
    window.resize(usualSize);
    app.setTake([&](const Start& other) {
        window.comeForward(other.token);
        return QString::fromStdString(companion.take(other.places));
    });
    companion.startTrialEngine();
    companion.start();
    window.show();
    return static_cast<ExitCode>(QApplication::exec());
}

} // namespace quorl
