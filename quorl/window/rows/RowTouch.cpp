#include "quorl/window/rows/RowTouch.h"

#include <QApplication>

namespace quorl {

namespace {

constexpr int fadeDuration = 350; // milliseconds

} // namespace

RowTouch::RowTouch(const WindowScreen& screen) : screen_(screen), fade_(fadeDuration) {
    connect(&fade_, &QVariantAnimation::valueChanged, this, [this] {
        if (litRow_) {
            Q_EMIT changed(*litRow_);
        }
    });
    connect(&fade_, &QVariantAnimation::finished, this, &RowTouch::endLight);
}

void RowTouch::hover(Row row) {
    const Row before = std::exchange(hoveredRow_, row);
    for (const Row& affected : {before, row}) {
        if (before != row && affected) {
            Q_EMIT changed(*affected);
        }
    }
}

void RowTouch::press(NSInteger row, QPointF position) {
    press_ = Press{row, position};
    light(row);
}

void RowTouch::moveTo(QPointF position, Row row) {
    const bool isDrag = press_ && (position - press_->position).manhattanLength() >
                                      QApplication::startDragDistance();
    if (isDrag && row != press_->row) {
        cancel();
    }
}

RowTouch::Row RowTouch::release(Row row) {
    if (!press_ || row != press_->row) {
        cancel();
        return std::nullopt;
    }
    press_.reset();
    return row;
}

void RowTouch::cancel() {
    press_.reset();
    if (litRow_) {
        fade();
    }
}

void RowTouch::light(NSInteger row) {
    endLight();
    litRow_ = row;
    Q_EMIT changed(row);
}

void RowTouch::fade() { fade_.begin(screen_.look().motion); }

void RowTouch::endLight() {
    fade_.stop();
    if (const Row row = std::exchange(litRow_, std::nullopt)) {
        Q_EMIT changed(*row);
    }
}

TouchState RowTouch::stateOf(NSInteger row) const {
    const double light = litRow_ != row ? 0 : fade_.isRunning() ? fade_.share() : 1;
    return {hoveredRow_ == row, light, false};
}

} // namespace quorl
