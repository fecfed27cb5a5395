#include "quorl/window/desktop/WindowMemory.h"

#include <QCoreApplication>
#include <QDir>
#include <QSettings>

namespace quorl {

namespace {

constexpr QSize usualSize(400, 720);
constexpr int smallestSide = 200;

const QString widthKey = QStringLiteral("width");
const QString heightKey = QStringLiteral("height");
const QString panesKey = QStringLiteral("panes");

QString usualFile() {
    const QString folder = qEnvironmentVariable("XDG_STATE_HOME");
    return (QDir::isAbsolutePath(folder) ? folder
                                         : QDir::homePath() + QStringLiteral("/.local/state")) +
           QStringLiteral("/quorl/window.ini");
}

} // namespace

WindowMemory WindowMemory::of(base::Purpose purpose) {
    return WindowMemory(purpose == base::Purpose::Trial ? QString() : usualFile());
}

QSize WindowMemory::size(const QSize& room) const {
    if (file_.isEmpty()) {
        return usualSize.boundedTo(room);
    }
    const QSettings kept(file_, QSettings::IniFormat);
    const QSize size(kept.value(widthKey).toInt(), kept.value(heightKey).toInt());
    const bool isSensible = size.width() >= smallestSide && size.height() >= smallestSide;
    return (isSensible ? size : usualSize).boundedTo(room);
}

std::optional<std::vector<std::string>> WindowMemory::panes() const {
    if (file_.isEmpty()) {
        return std::nullopt;
    }
    const QSettings kept(file_, QSettings::IniFormat);
    if (!kept.contains(panesKey)) {
        return std::nullopt;
    }
    std::vector<std::string> panes;
    for (const QString& pane : kept.value(panesKey).toStringList()) {
        panes.push_back(pane.toStdString());
    }
    return panes;
}

QString WindowMemory::keep(const WindowState& state) const {
    if (file_.isEmpty()) {
        return {};
    }
    QStringList panes;
    for (const std::string& pane : state.panes) {
        panes << QString::fromStdString(pane);
    }
    QSettings kept(file_, QSettings::IniFormat);
    kept.clear();
    kept.setValue(widthKey, state.size.width());
    kept.setValue(heightKey, state.size.height());
    kept.setValue(panesKey, panes);
    kept.sync();
    return kept.status() == QSettings::AccessError
               ? QCoreApplication::translate("WindowMemory",
                                             "The size of the window could not be kept in %1. Make "
                                             "room there, or let it be written.")
                     .arg(file_)
               : QString();
}

} // namespace quorl
