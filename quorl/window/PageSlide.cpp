#include "quorl/window/PageSlide.h"

#include <QPainter>

namespace quorl {

namespace {

constexpr int slideDuration = 220; // milliseconds
constexpr qreal lag = 0.3;         // the lower page moves less

} // namespace

PageSlide::PageSlide(QWidget* pages) : QWidget(pages), fade_(slideDuration) {
    hide();
    connect(&fade_, &QVariantAnimation::valueChanged, this, qOverload<>(&QWidget::update));
    connect(&fade_, &QVariantAnimation::finished, this, &PageSlide::end);
}

void PageSlide::begin(const QRect& place, const QPixmap& before, const QPixmap& after,
                      Direction direction, Motion motion) {
    before_ = before;
    after_ = after;
    direction_ = direction;
    setGeometry(place);
    show();
    raise();
    fade_.begin(motion);
}

/// Pictures of pages take as much memory as a window.
void PageSlide::end() {
    hide();
    before_ = QPixmap();
    after_ = QPixmap();
}

void PageSlide::paintEvent(QPaintEvent* /*event*/) {
    QPainter painter(this);
    const bool isForward = direction_ == Direction::Forward;
    const qreal away = isForward ? fade_.share() : 1 - fade_.share(); // of the upper page
    const qreal sign = layoutDirection() == Qt::RightToLeft ? -1 : 1;
    const QPixmap& upper = isForward ? after_ : before_;
    const QPixmap& lower = isForward ? before_ : after_;
    painter.drawPixmap(QPointF(-sign * lag * (1 - away) * width(), 0), lower);
    painter.drawPixmap(QPointF(sign * away * width(), 0), upper);
}

} // namespace quorl
