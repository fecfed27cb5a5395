#pragma once

#include <QWidget>

#include "quorl/window/look/WindowScreen.h"

namespace quorl {

/// The edge of a window without a frame of the system's: a line that tells it from others, by which
/// it is made larger or smaller. Not there while the window has all of the screen. Main thread.
class FrameEdge final : public QWidget {
    Q_OBJECT

  public:
    /// `window` owns the edge; `screen` outlives it.
    FrameEdge(WindowScreen& screen, QWidget& window);

    /// The edges that somebody moves who takes hold of the window there; none in its midst.
    [[nodiscard]] Qt::Edges edgesAt(QPoint place) const;

    bool eventFilter(QObject* watched, QEvent* event) override;

  protected:
    void mouseMoveEvent(QMouseEvent* event) override;
    void mousePressEvent(QMouseEvent* event) override;
    void paintEvent(QPaintEvent* event) override;

  private:
    void fit();

    WindowScreen& screen_;
};

} // namespace quorl
