#include "quorl/process/QtSetup.h"

#include <QGuiApplication>
#include <QLibraryInfo>
#include <QLocale>

#include "quorl/process/QtMessages.h"
#include "quorl/process/QtTexts.h"
#include "services/language/Languages.h"

namespace quorl {

QtSetup::QtSetup(char* program) : arguments_{program, nullptr} {
    takeQtMessages();
    language::followLanguages(language::usersLanguages());
    QCoreApplication::setApplicationName(QStringLiteral("quorl"));
    QCoreApplication::setApplicationVersion(QStringLiteral(QUORL_VERSION));
    QGuiApplication::setDesktopFileName(QStringLiteral("org.quorl.Velora"));
}

bool QtSetup::hasDisplay() {
    return qEnvironmentVariableIsSet("DISPLAY") || qEnvironmentVariableIsSet("WAYLAND_DISPLAY") ||
           qEnvironmentVariableIsSet("QT_QPA_PLATFORM");
}

void QtSetup::followUsersLanguage() {
    const QLocale locale(QString::fromStdString(language::followedLanguages().front()));
    QLocale::setDefault(locale);
    QGuiApplication::setLayoutDirection(locale.textDirection());
    static QTranslator ofQt;
    if (ofQt.load(locale, QStringLiteral("qtbase"), QStringLiteral("_"),
                  QLibraryInfo::path(QLibraryInfo::TranslationsPath))) {
        QCoreApplication::installTranslator(&ofQt);
    }
    static QtTexts own;
    QCoreApplication::installTranslator(&own);
}

} // namespace quorl
