#pragma once

#include <QFont>
#include <QRectF>

#include "quorl/app/PaneScreen.h"

namespace quorl {

/// The screen that a window is: real fonts and device pixels. Main thread.
class WindowScreen final : public PaneScreen {
    Q_OBJECT

  public:
    WindowScreen();

    /// What rows are written in.
    [[nodiscard]] const QFont& font() const { return font_; }

    /// The height of a row, in points: at least what a finger and two lines need, and
    /// whole device pixels.
    [[nodiscard]] qreal rowHeight() const;

    /// Takes the width of the rows and the scale of the window from now on.
    void setGeometry(qreal rowWidth, qreal scale);

    /// Takes another font, scaled from the application's.
    void setFont(const QFont& applicationFont);

    [[nodiscard]] CGFloat scale() const override { return static_cast<CGFloat>(scale_); }

    [[nodiscard]] CGSize rowSize() const override;
    [[nodiscard]] CGSize sizeOfText(const UILabel& label) const override;
    void layOutLabels(UITableViewCell& cell) override;

  private:
    QFont font_;
    qreal rowWidth_ = 0;
    qreal scale_ = 1;
};

} // namespace quorl
