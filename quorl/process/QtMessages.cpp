#include "quorl/process/QtMessages.h"

#include <QString>
#include <cstdlib>
#include <iostream>

#include "quorl/process/ExitCode.h"
#include "services/language/Translated.h"

namespace quorl {

using language::translated;

namespace {

/// All that Qt gives of a display that has gone is what it says before it ends the process.
bool isDisplayGone(const QString& text) {
    return text.startsWith(QStringLiteral("The X11 connection broke")) ||
           text.startsWith(QStringLiteral("The Wayland connection "));
}

/// At once: what would be taken down in order is in the midst of being called.
[[noreturn]] void endWith(const std::string& sentence) {
    std::cerr << "quorl: " << sentence << std::endl;
    std::_Exit(static_cast<int>(ExitCode::Failure));
}

void take(QtMsgType type, const QMessageLogContext& context, const QString& text) {
    if (isDisplayGone(text)) {
        endWith(translated("The display has gone. Start quorl again when there is one."));
    }
    if (type == QtFatalMsg) {
        endWith(language::filled(
            translated("{reason}. Start quorl on a display that works, or with --text."),
            {{"reason", text.section(u'.', 0, 0).toStdString()}}));
    }
    std::cerr << qFormatLogMessage(type, context, text).toStdString() << '\n';
}

} // namespace

void takeQtMessages() { qInstallMessageHandler(take); }

} // namespace quorl
