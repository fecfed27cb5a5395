#include "quorl/reports/Screenshot.h"

#include <QCoreApplication>
#include <QImageWriter>
#include <QPixmap>
#include <QPointer>
#include <QTimer>
#include <iostream>

namespace quorl {

Screenshot::Screenshot(Options options, Companion& companion, MainWindow& window)
    : options_(std::move(options)), companion_(companion), window_(window) {
    connect(&companion, &Companion::idle, this, &Screenshot::beginWhenSettled);
}

void Screenshot::beginWhenSettled() {
    if (companion_.isSettled()) {
        disconnect(&companion_, &Companion::idle, this, nullptr);
        waitUntilDrawn(&Screenshot::openPane);
    }
}

/// Goes on behind all that the main queue holds now, and behind the drawing that it leads to.
void Screenshot::waitUntilDrawn(void (Screenshot::*next)()) {
    // The picture may have been given up meanwhile.
    dispatch_async(dispatch_get_main_queue(), [self = QPointer(this), next] {
        if (self) {
            self->companion_.screen().scheduleDrawing();
            connect(
                &self->companion_.screen(), &PaneScreen::drawing, self, next,
                static_cast<Qt::ConnectionType>(Qt::QueuedConnection | Qt::SingleShotConnection));
        }
    });
}

void Screenshot::openPane() {
    RowsView* view = window_.topView();
    if (options_.pane == Options::Pane::Front) {
        window_.goBack();
    } else if (view && options_.pane != Options::Pane::Root) {
        view->tap(options_.pane == Options::Pane::Playlist ? 0 : 1);
    }
    waitUntilDrawn(&Screenshot::take);
}

void Screenshot::take() {
    QImageWriter writer(QString::fromStdString(options_.screenshot.string()), "png");
    if (writer.write(window_.grab().toImage())) {
        QCoreApplication::exit(static_cast<int>(ExitCode::Success));
        return;
    }
    std::cerr << "quorl: The picture could not be written to " << options_.screenshot.string()
              << ": " << writer.errorString().toStdString()
              << ". Choose another file, or make room for it.\n";
    QCoreApplication::exit(static_cast<int>(ExitCode::Failure));
}

} // namespace quorl
