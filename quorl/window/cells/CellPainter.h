#pragma once

#include <QPainter>

#include "platform/UserInterface.h"
#include "quorl/window/look/PaneColors.h"

namespace quorl {

/// Paints a cell that has been laid out, into a row at `place`. With a right-to-left direction the
/// finished layout is mirrored.
void paintCell(QPainter& painter, const UITableViewCell& cell, const QRectF& place,
               const QFont& font, const PaneColors& colors, Qt::LayoutDirection direction);

} // namespace quorl
