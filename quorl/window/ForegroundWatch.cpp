#include "quorl/window/ForegroundWatch.h"

#include <QEvent>
#include <QGuiApplication>

namespace quorl {

namespace {

bool isPutAside(Qt::ApplicationState state) {
    return state == Qt::ApplicationHidden || state == Qt::ApplicationSuspended;
}

} // namespace

ForegroundWatch::ForegroundWatch(QWidget& window, Companion& companion)
    : window_(window), companion_(companion) {
    window.installEventFilter(this);
    connect(qGuiApp, &QGuiApplication::applicationStateChanged, this,
            [this](Qt::ApplicationState state) {
                setInBackground(isPutAside(state) || window_.isHidden() || window_.isMinimized());
            });
}

bool ForegroundWatch::eventFilter(QObject* /*watched*/, QEvent* event) {
    switch (event->type()) {
    case QEvent::Hide:
        setInBackground(true);
        break;
    case QEvent::Show:
        setInBackground(window_.isMinimized());
        break;
    case QEvent::WindowStateChange:
        setInBackground(window_.isHidden() || window_.isMinimized());
        break;
    case QEvent::WindowActivate:
    case QEvent::WindowDeactivate:
        tellSeen();
        break;
    default:
        break;
    }
    return false;
}

void ForegroundWatch::setInBackground(bool isInBackground) {
    if (isInBackground_ == isInBackground) {
        return;
    }
    isInBackground_ = isInBackground;
    if (isInBackground) {
        companion_.enterBackground();
    } else {
        companion_.enterForeground();
    }
    tellSeen();
}

void ForegroundWatch::tellSeen() {
    companion_.setSeen(window_.isActiveWindow() && !isInBackground_);
}

} // namespace quorl
