#pragma once

#include <QScrollBar>
#include <QTimer>

#include "quorl/window/look/WindowScreen.h"

namespace quorl {

/// A scroll bar over the end of a page's margin, seen only while the page scrolls or a pointer is
/// near. Its thumb can be dragged. Main thread.
class OverlayScrollBar final : public QWidget {
    Q_OBJECT

  public:
    static constexpr int thickness = 14; ///< in points, of what takes a pointer

    /// Shows where `bar` stands, in an area of which it is a child. Both and `screen` outlive it.
    OverlayScrollBar(QScrollBar& bar, WindowScreen& screen, QWidget* area);

    /// Takes its place at the end of the lines of the area's part `page`.
    void setPage(const QRect& page);

    /// Shows itself for a while, where there is anything to scroll.
    void appear();

    [[nodiscard]] QRectF thumb() const;

  protected:
    void paintEvent(QPaintEvent* event) override;
    void mousePressEvent(QMouseEvent* event) override;
    void mouseMoveEvent(QMouseEvent* event) override;
    void mouseReleaseEvent(QMouseEvent* event) override;

  private:
    void disappear();

    QScrollBar& bar_;
    WindowScreen& screen_;
    QTimer rest_;
    std::optional<qreal> grip_; ///< where the thumb is held, from its top
};

} // namespace quorl
