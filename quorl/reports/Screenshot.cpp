#include "quorl/reports/Screenshot.h"

#include <QCoreApplication>
#include <QImageWriter>
#include <QPixmap>
#include <iostream>

namespace quorl {

Screenshot::Screenshot(Options options, Companion& companion, MainWindow& window)
    : options_(std::move(options)), companion_(companion), window_(window) {
    connect(&companion, &Companion::idle, this, &Screenshot::beginWhenSettled);
}

void Screenshot::beginWhenSettled() {
    if (companion_.isSettled()) {
        disconnect(&companion_, &Companion::idle, this, nullptr);
        companion_.screen().whenDrawn(*this, [this] { openPane(); });
    }
}

void Screenshot::openPane() {
    RowsView* view = window_.topView();
    if (options_.pane == Options::Pane::Front) {
        window_.goBack();
    } else if (view && options_.pane != Options::Pane::Root) {
        view->tap(options_.pane == Options::Pane::Playlist ? 0 : 1);
    }
    companion_.screen().whenDrawn(*this, [this] { take(); });
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
