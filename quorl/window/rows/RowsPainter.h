#pragma once

#include <QPainter>
#include <functional>

#include "quorl/window/look/TouchState.h"
#include "quorl/window/look/WindowScreen.h"
#include "quorl/window/rows/RowsLayout.h"

namespace quorl {

/// Paints what a pane shows, as far as it is exposed. Lives for one painting.
class RowsPainter {
  public:
    /// What is painted; all of it outlives the painter.
    struct Subject {
        const PaneContent& content;
        const RowsLayout& layout;
        const WindowScreen& screen;
        const PaneColors& colors;
        std::function<TouchState(NSInteger row)> stateOf;
    };

    /// `painter` has the pane's own coordinates, and the layout direction of the view.
    RowsPainter(QPainter& painter, const Subject& subject)
        : painter_(painter), subject_(subject), direction_(painter.layoutDirection()) {}

    void paint(const QRectF& exposed);

  private:
    void paintTexts(const PaneContent::Section& content, const RowsLayout::Section& section,
                    const QRectF& exposed);
    void paintCard(const RowsLayout::Section& section, const QRectF& exposed);
    void paintRow(NSInteger row, bool isLast);
    void paintSeparator(const QRectF& row);

    [[nodiscard]] qreal pixel() const { return 1 / static_cast<qreal>(subject_.screen.scale()); }

    QPainter& painter_;
    const Subject& subject_;
    const Qt::LayoutDirection direction_;
};

} // namespace quorl
