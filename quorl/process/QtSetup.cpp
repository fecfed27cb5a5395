#include "quorl/process/QtSetup.h"

#include <QGuiApplication>
#include <QLocale>

#include "quorl/process/QtMessages.h"
#include "runtime/plugins/StringTable.h"

namespace quorl {

QtSetup::QtSetup(char* program) : arguments_{program, nullptr} {
    takeQtMessages();
    QCoreApplication::setApplicationName(QStringLiteral("quorl"));
    QCoreApplication::setApplicationVersion(QStringLiteral(QUORL_VERSION));
    QGuiApplication::setDesktopFileName(QStringLiteral("org.quorl.Velora"));
}

bool QtSetup::hasDisplay() {
    return qEnvironmentVariableIsSet("DISPLAY") || qEnvironmentVariableIsSet("WAYLAND_DISPLAY") ||
           qEnvironmentVariableIsSet("QT_QPA_PLATFORM");
}

void QtSetup::followUsersLanguage() {
    const QLocale locale(QString::fromStdString(environmentLanguages().front()));
    QLocale::setDefault(locale);
    QGuiApplication::setLayoutDirection(locale.textDirection());
}

} // namespace quorl
