#include "quorl/app/Run.h"

#include <QApplication>
#include <QCursor>
#include <QLocale>
#include <array>
#include <iostream>
#include <optional>

#include <unistd.h>

#include "quorl/reports/Screenshot.h"
#include "quorl/terminal/TextScreen.h"
#include "quorl/terminal/TextSession.h"
#include "quorl/window/MainWindow.h"
#include "runtime/plugins/StringTable.h"

namespace quorl {

namespace {

constexpr QSize usualSize(400, 720);

/// Qt's view of the arguments: only the program, as its own options are none of ours.
struct Arguments {
    explicit Arguments(char* program) : values{program, nullptr} {}

    int count = 1;
    std::array<char*, 2> values;
};

void nameApplication() {
    QCoreApplication::setApplicationName(QStringLiteral("quorl"));
    QCoreApplication::setApplicationVersion(QStringLiteral(QUORL_VERSION));
    QGuiApplication::setDesktopFileName(QStringLiteral("org.quorl.Velora"));
}

bool hasDisplay() {
    return qEnvironmentVariableIsSet("DISPLAY") || qEnvironmentVariableIsSet("WAYLAND_DISPLAY") ||
           qEnvironmentVariableIsSet("QT_QPA_PLATFORM");
}

void followUsersLanguage() {
    const QLocale locale(QString::fromStdString(environmentLanguages().front()));
    QLocale::setDefault(locale);
    QGuiApplication::setLayoutDirection(locale.textDirection());
}

} // namespace

ExitCode runInWindow(char* program, const Options& options) {
    if (!hasDisplay()) {
        std::cerr << "quorl: There is no display here. Start quorl in a graphical session, or with "
                     "--text.\n";
        return ExitCode::Failure;
    }
    nameApplication();
    Arguments arguments(program);
    QApplication application(arguments.count, arguments.values.data());
    followUsersLanguage();
    WindowScreen screen;
    Notices notices;
    Companion companion(options, screen, notices);
    MainWindow window(companion, screen);
    window.resize(usualSize);
    companion.start();
    window.show();
    return static_cast<ExitCode>(QApplication::exec());
}

ExitCode runInTerminal(char* program, const Options& options) {
    nameApplication();
    Arguments arguments(program);
    const QCoreApplication application(arguments.count, arguments.values.data());
    TextScreen screen;
    Notices notices;
    Companion companion(options, screen, notices);
    const TextSession session(companion, STDIN_FILENO, std::cout);
    companion.start();
    return static_cast<ExitCode>(QCoreApplication::exec());
}

ExitCode takeScreenshot(char* program, const Options& options) {
    if (!hasDisplay()) {
        qputenv("QT_QPA_PLATFORM", "offscreen");
    }
    qputenv("QT_SCALE_FACTOR", QByteArray::number(options.scale));
    nameApplication();
    Arguments arguments(program);
    QApplication application(arguments.count, arguments.values.data());
    followUsersLanguage();
    if (QGuiApplication::platformName() == QStringLiteral("offscreen")) {
        QCursor::setPos(options.width, options.height); // nobody's pointer, out of the picture
    }
    if (options.dark) {
        QApplication::setPalette(darkPalette());
    }
    WindowScreen screen;
    Notices notices;
    Companion companion(options, screen, notices);
    MainWindow window(companion, screen);
    window.resize(options.width, options.height);
    const Screenshot screenshot(options, companion, window);
    companion.start();
    window.show();
    return static_cast<ExitCode>(QApplication::exec());
}

} // namespace quorl
