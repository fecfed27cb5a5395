#pragma once

#include <QToolButton>

#include "quorl/window/look/WindowScreen.h"

namespace quorl {

/// A button without a box, which looks under the pointer and under a finger as a row does. Its text
/// and its picture have the tint. Main thread.
class FlatButton final : public QToolButton {
    Q_OBJECT

  public:
    static constexpr int smallestSide = 44; ///< what a finger needs, in points

    /// Draws what the button shows into a square of the button's icon size, with the pen of its
    /// tint; `isMirrored` where people read from right to left.
    using Drawing = void (*)(QPainter& painter, const QSizeF& size, bool isMirrored);

    /// `screen` outlives the button. Null for no picture.
    FlatButton(WindowScreen& screen, Drawing drawing, QWidget* parent);

  protected:
    void paintEvent(QPaintEvent* event) override;
    void changeEvent(QEvent* event) override;

  private:
    void dress();

    WindowScreen& screen_;
    const Drawing drawing_;
};

} // namespace quorl
