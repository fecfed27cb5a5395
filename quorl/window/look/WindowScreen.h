#pragma once

#include <QFont>
#include <QRectF>

#include "quorl/app/PaneScreen.h"
#include "quorl/window/look/LastInput.h"
#include "quorl/window/look/Look.h"

namespace quorl {

/// The screen that a window is: real fonts and device pixels. Main thread.
class WindowScreen final : public PaneScreen {
    Q_OBJECT

  public:
    WindowScreen();

    /// How things are to look now. At first nothing moves where the toolkit's style does not.
    [[nodiscard]] const Look& look() const { return look_; }

    void setLook(const Look& look);

    [[nodiscard]] const LastInput& lastInput() const { return lastInput_; }

    /// What rows are written in.
    [[nodiscard]] const QFont& font() const { return font_; }

    /// What titles and footers of groups are written in.
    [[nodiscard]] QFont headingFont() const;
    [[nodiscard]] QFont smallFont() const;

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

  Q_SIGNALS:
    void lookChanged();

  private:
    Look look_;
    LastInput lastInput_;
    QFont font_;
    qreal rowWidth_ = 0;
    qreal scale_ = 1;
};

} // namespace quorl
