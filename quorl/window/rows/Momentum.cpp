#include "quorl/window/rows/Momentum.h"

#include <QWheelEvent>

namespace quorl {

namespace {

QScroller& scrollerOf(QWidget& viewport) {
    QScroller::grabGesture(&viewport, QScroller::TouchGesture);
    return *QScroller::scroller(&viewport);
}

} // namespace

Momentum::Momentum(QWidget& viewport) : scroller_(scrollerOf(viewport)) {
    connect(&scroller_, &QScroller::stateChanged, this, &Momentum::follow);
}

void Momentum::follow(QScroller::State state) {
    const auto before = std::exchange(state_, state);
    if (state == QScroller::Pressed) {
        stopsByTouch_ = before == QScroller::Scrolling;
    } else if (state != QScroller::Dragging) { // that is still the same finger
        stopsByTouch_ = false;
    } else {
        Q_EMIT dragged();
    }
}

bool Momentum::takesPress() {
    const bool isMoving = stopsByTouch_ || rollsByWheel_ || state_ == QScroller::Scrolling;
    ignoresWheel_ = rollsByWheel_;
    rollsByWheel_ = false;
    if (state_ == QScroller::Scrolling) {
        scroller_.stop(); // pressed by what is no finger
    }
    return isMoving;
}

bool Momentum::isOver(const QWheelEvent& event) {
    rollsByWheel_ = event.phase() == Qt::ScrollMomentum && !ignoresWheel_;
    ignoresWheel_ = ignoresWheel_ && event.phase() == Qt::ScrollMomentum;
    return ignoresWheel_;
}

void Momentum::stop() { (void)takesPress(); }

} // namespace quorl
