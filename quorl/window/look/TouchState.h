#pragma once

#include <QPainter>

#include "quorl/window/look/PaneColors.h"

namespace quorl {

/// How something that can be tapped stands, be it a row or a button: both look the same.
struct TouchState {
    bool isHovered = false;
    double pressed = 0; ///< from 0 to 1, where a press fades
    bool isRinged = false;
    bool isMarked = false; ///< what it opens is seen beside it

    /// Paints what lies behind the text.
    void paintGround(QPainter& painter, const QRectF& place, qreal radius,
                     const PaneColors& colors) const;

    /// Paints the ring around the focus, within the place.
    void paintRing(QPainter& painter, const QRectF& place, qreal radius,
                   const PaneColors& colors) const;
};

} // namespace quorl
