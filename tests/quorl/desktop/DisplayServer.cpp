#include "tests/quorl/desktop/DisplayServer.h"

#include <QFileInfo>
#include <QTest>
#include <stdexcept>

namespace quorl::tests {

namespace {

constexpr int patience = 60'000; // milliseconds

} // namespace

DisplayServer::DisplayServer(Kind kind) {
    process_.setProcessChannelMode(QProcess::SeparateChannels);
    if (kind == Kind::X11) {
        startX11();
    } else {
        startWayland();
    }
}

DisplayServer::~DisplayServer() { end(); }

void DisplayServer::startX11() {
    process_.start(QStringLiteral("Xvfb"), {QStringLiteral("-displayfd"), QStringLiteral("1"),
                                            QStringLiteral("-nolisten"), QStringLiteral("tcp")});
    while (!process_.canReadLine()) {
        if (!process_.waitForReadyRead(patience)) {
            throw std::runtime_error("Xvfb does not start: " +
                                     process_.readAllStandardError().toStdString());
        }
    }
    environment_["DISPLAY"] = ":" + process_.readLine().trimmed().toStdString();
}

void DisplayServer::startWayland() {
    const QString socket = QStringLiteral("quorl-test");
    process_.start(QStringLiteral("weston"),
                   {QStringLiteral("--backend=headless-backend.so"), QStringLiteral("--no-config"),
                    QStringLiteral("--idle-time=0"), QStringLiteral("--socket=") + socket});
    const QString path = qEnvironmentVariable("XDG_RUNTIME_DIR") + u'/' + socket;
    if (!QTest::qWaitFor([&path] { return QFileInfo::exists(path); }, patience)) {
        throw std::runtime_error("weston does not start: " +
                                 process_.readAllStandardError().toStdString());
    }
    environment_["WAYLAND_DISPLAY"] = socket.toStdString();
}

void DisplayServer::end() {
    process_.terminate();
    process_.waitForFinished(patience);
}

} // namespace quorl::tests
