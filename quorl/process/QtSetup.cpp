#include "quorl/process/QtSetup.h"

#include <QGuiApplication>
#include <QLibraryInfo>
#include <QLocale>

#include "quorl/process/QtMessages.h"
#include "quorl/process/QtTexts.h"
#include "services/language/Languages.h"
#include "services/language/Translated.h"

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

std::string QtSetup::displayProblem() {
    return hasDisplay() ? ""
                        : language::translated("There is no display here. Start quorl in a "
                                               "graphical session, or with --text.");
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
