#pragma once

#include <QPainter>

#include "platform/UserInterface.h"
#include "quorl/window/look/PaneColors.h"

namespace quorl {

/// What is free at either end of a row, in points.
constexpr qreal cellMargin = 16;

/// What a cell's checkmark, chevron or switch takes before the margin at the end, with a gap; 0 for
/// a cell that has none.
[[nodiscard]] qreal accessoryRoom(const UITableViewCell& cell);

/// Paints a cell that has been laid out, into a row at `place`. With a right-to-left direction the
/// finished layout is mirrored.
void paintCell(QPainter& painter, const UITableViewCell& cell, const QRectF& place,
               const QFont& font, const PaneColors& colors, Qt::LayoutDirection direction);

} // namespace quorl
