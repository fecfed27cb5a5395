#include "quorl/process/QtMessages.h"

#include <QString>
#include <cstdlib>
#include <iostream>

#include "quorl/process/ExitCode.h"

namespace quorl {

namespace {

/// All that Qt gives of a display that has gone is what it says before it ends the process.
bool isDisplayGone(const QString& text) {
    return text.startsWith(QStringLiteral("The X11 connection broke")) ||
           text.startsWith(QStringLiteral("The Wayland connection "));
}

/// At once: what would be taken down in order is in the midst of being called.
[[noreturn]] void endWith(const QString& sentence) {
    std::cerr << "quorl: " << sentence.toStdString() << std::endl;
    std::_Exit(static_cast<int>(ExitCode::Failure));
}

void take(QtMsgType type, const QMessageLogContext& context, const QString& text) {
    if (isDisplayGone(text)) {
        endWith(QStringLiteral("The display has gone. Start quorl again when there is one."));
    }
    if (type == QtFatalMsg) {
        endWith(text.section(u'.', 0, 0) +
                QStringLiteral(". Start quorl on a display that works, or with --text."));
    }
    std::cerr << qFormatLogMessage(type, context, text).toStdString() << '\n';
}

} // namespace

void takeQtMessages() { qInstallMessageHandler(take); }

} // namespace quorl
