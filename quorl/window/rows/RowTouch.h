#pragma once

#include <QPointF>

#include "quorl/window/look/Fade.h"
#include "quorl/window/look/TouchState.h"
#include "quorl/window/look/WindowScreen.h"

namespace quorl {

/// What a pointer does to the rows of a view: over which it is, which it presses, which it taps,
/// and how long that is seen. Main thread.
class RowTouch final : public QObject {
    Q_OBJECT

  public:
    using Row = std::optional<NSInteger>;

    /// `screen` outlives this object.
    explicit RowTouch(const WindowScreen& screen);

    /// The pointer is over a row, or over none.
    void hover(Row row);

    void press(NSInteger row, QPointF position);

    /// A pointer that is down is over another place now; a press that leaves its row is over.
    void moveTo(QPointF position, Row row);

    /// The pointer is lifted over a row; gives the row that this taps, if any. That stays lit.
    [[nodiscard]] Row release(Row row);

    /// Nothing is pressed any more, and nothing tapped.
    void cancel();

    [[nodiscard]] bool isDown() const { return press_.has_value(); }

    [[nodiscard]] Row pressedRow() const { return press_ ? Row(press_->row) : std::nullopt; }

    /// Shows a row as tapped, until its light fades or ends.
    void light(NSInteger row);

    void fade();
    void endLight();

    [[nodiscard]] Row litRow() const { return litRow_; }

    [[nodiscard]] bool isFading() const { return fade_.isRunning(); }

    /// How a row looks, but for the focus.
    [[nodiscard]] TouchState stateOf(NSInteger row) const;

  Q_SIGNALS:
    /// The row looks different now.
    void changed(NSInteger row);

  private:
    struct Press {
        NSInteger row;
        QPointF position;
    };

    const WindowScreen& screen_;
    Row hoveredRow_;
    std::optional<Press> press_;
    Row litRow_;
    Fade fade_;
};

} // namespace quorl
