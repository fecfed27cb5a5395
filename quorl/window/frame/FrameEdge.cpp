#include "quorl/window/frame/FrameEdge.h"

#include <QEvent>
#include <QMouseEvent>
#include <QPainter>
#include <QWindow>

#include "quorl/window/look/PaneColors.h"

namespace quorl {

namespace {

constexpr int grip = 5;    // in points
constexpr int corner = 16; // along both edges

Qt::CursorShape cursorFor(Qt::Edges edges) {
    const bool isDiagonal =
        edges == (Qt::TopEdge | Qt::LeftEdge) || edges == (Qt::BottomEdge | Qt::RightEdge);
    const bool isAcross =
        edges == (Qt::TopEdge | Qt::RightEdge) || edges == (Qt::BottomEdge | Qt::LeftEdge);
    return isDiagonal                                         ? Qt::SizeFDiagCursor
           : isAcross                                         ? Qt::SizeBDiagCursor
           : edges.testAnyFlags(Qt::LeftEdge | Qt::RightEdge) ? Qt::SizeHorCursor
                                                              : Qt::SizeVerCursor;
}

} // namespace

FrameEdge::FrameEdge(WindowScreen& screen, QWidget& window) : QWidget(&window), screen_(screen) {
    setMouseTracking(true);
    window.installEventFilter(this);
    connect(&screen, &WindowScreen::lookChanged, this, qOverload<>(&QWidget::update));
    fit();
}

bool FrameEdge::eventFilter(QObject* /*watched*/, QEvent* event) {
    if (event->type() == QEvent::Resize || event->type() == QEvent::WindowStateChange) {
        fit();
    }
    return false;
}

void FrameEdge::fit() {
    setGeometry(window()->rect());
    setMask(QRegion(rect()) - rect().adjusted(grip, grip, -grip, -grip));
    setVisible(!window()->isMaximized() && !window()->isFullScreen());
    raise();
}

Qt::Edges FrameEdge::edgesAt(QPoint place) const {
    if (rect().adjusted(grip, grip, -grip, -grip).contains(place)) {
        return {};
    }
    Qt::Edges edges;
    edges.setFlag(Qt::LeftEdge, place.x() < corner);
    edges.setFlag(Qt::RightEdge, place.x() >= width() - corner);
    edges.setFlag(Qt::TopEdge, place.y() < corner);
    edges.setFlag(Qt::BottomEdge, place.y() >= height() - corner);
    return edges;
}

void FrameEdge::mouseMoveEvent(QMouseEvent* event) {
    setCursor(cursorFor(edgesAt(event->position().toPoint())));
}

void FrameEdge::mousePressEvent(QMouseEvent* event) {
    if (event->button() == Qt::LeftButton) {
        window()->windowHandle()->startSystemResize(edgesAt(event->position().toPoint()));
    }
}

void FrameEdge::paintEvent(QPaintEvent* /*event*/) {
    QPainter painter(this);
    painter.setPen(PaneColors::of(palette(), screen_.look()).mark);
    painter.drawRect(rect().adjusted(0, 0, -1, -1));
}

} // namespace quorl
