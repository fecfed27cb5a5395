#include "quorl/window/look/TouchState.h"

namespace quorl {

void TouchState::paintGround(QPainter& painter, const QRectF& place, qreal radius,
                             const PaneColors& colors) const {
    painter.save();
    painter.setRenderHint(QPainter::Antialiasing);
    painter.setPen(Qt::NoPen);
    if (isHovered) {
        painter.setBrush(colors.hover);
        painter.drawRoundedRect(place, radius, radius);
    }
    if (pressed > 0 || isMarked) {
        painter.setOpacity(isMarked ? 1 : pressed);
        painter.setBrush(colors.pressed);
        painter.drawRoundedRect(place, radius, radius);
    }
    painter.restore();
}

void TouchState::paintRing(QPainter& painter, const QRectF& place, qreal radius,
                           const PaneColors& colors) const {
    if (!isRinged) {
        return;
    }
    painter.save();
    painter.setRenderHint(QPainter::Antialiasing);
    painter.setPen(QPen(colors.tint, 2));
    painter.drawRoundedRect(place.adjusted(2, 2, -2, -2), radius, radius);
    painter.restore();
}

} // namespace quorl
