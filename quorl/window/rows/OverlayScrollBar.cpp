#include "quorl/window/rows/OverlayScrollBar.h"

#include <QMouseEvent>
#include <QPainter>
#include <QStyle>

#include "quorl/window/look/PaneColors.h"

namespace quorl {

namespace {

constexpr int restDuration = 1200; // milliseconds
constexpr qreal smallestThumb = 36;
constexpr qreal thumbWidth = 6;
constexpr qreal inset = 4;

} // namespace

OverlayScrollBar::OverlayScrollBar(QScrollBar& bar, WindowScreen& screen, QWidget* area)
    : QWidget(area), bar_(bar), screen_(screen) {
    hide();
    rest_.setSingleShot(true);
    rest_.setInterval(restDuration);
    connect(&rest_, &QTimer::timeout, this, &OverlayScrollBar::disappear);
    connect(&bar, &QScrollBar::valueChanged, this, &OverlayScrollBar::appear);
    connect(&bar, &QScrollBar::rangeChanged, this, qOverload<>(&QWidget::update));
}

void OverlayScrollBar::setPage(const QRect& page) {
    const QRect end(page.right() + 1 - thickness, page.top(), thickness, page.height());
    setGeometry(QStyle::visualRect(layoutDirection(), page, end));
}

void OverlayScrollBar::appear() {
    if (bar_.maximum() == 0) {
        return;
    }
    show();
    raise();
    update();
    rest_.start();
}

void OverlayScrollBar::disappear() {
    if (grip_ || underMouse()) {
        rest_.start();
    } else {
        hide();
    }
}

QRectF OverlayScrollBar::thumb() const {
    const qreal track = height() - 2 * inset;
    const qreal all = bar_.maximum() + bar_.pageStep();
    const qreal length = std::min(std::max(track * bar_.pageStep() / all, smallestThumb), track);
    const qreal top = inset + (track - length) * bar_.value() / std::max(bar_.maximum(), 1);
    return {(width() - thumbWidth) / 2.0, top, thumbWidth, length};
}

void OverlayScrollBar::paintEvent(QPaintEvent* /*event*/) {
    QPainter painter(this);
    painter.setRenderHint(QPainter::Antialiasing);
    painter.setPen(Qt::NoPen);
    painter.setBrush(PaneColors::of(palette(), screen_.look()).mark);
    painter.drawRoundedRect(thumb(), thumbWidth / 2, thumbWidth / 2);
}

void OverlayScrollBar::mousePressEvent(QMouseEvent* event) {
    const QRectF place = thumb();
    const qreal y = event->position().y();
    const bool isOnThumb = y >= place.top() && y < place.bottom();
    grip_ = isOnThumb ? y - place.top() : place.height() / 2; // elsewhere it comes to the pointer
    mouseMoveEvent(event);
}

void OverlayScrollBar::mouseMoveEvent(QMouseEvent* event) {
    const qreal free = height() - 2 * inset - thumb().height();
    if (grip_ && free > 0) {
        bar_.setValue(qRound((event->position().y() - *grip_ - inset) / free * bar_.maximum()));
    }
}

void OverlayScrollBar::mouseReleaseEvent(QMouseEvent* /*event*/) {
    grip_.reset();
    rest_.start();
}

} // namespace quorl
