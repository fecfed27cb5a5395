#pragma once

#include <QStringList>
#include <QWidget>

namespace quorl::tests {

/// A line of text, or a piece of one, as it was drawn.
struct DrawnText {
    QString text;
    /// From one end of the line to the other, in the units of the widget.
    qreal left = 0;
    qreal right = 0;
};

/// All that the widget and what is in it draw, in that order.
[[nodiscard]] QList<DrawnText> drawnTexts(QWidget& widget);

} // namespace quorl::tests
