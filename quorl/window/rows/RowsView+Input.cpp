#include <QApplication>
#include <QContextMenuEvent>
#include <QHelpEvent>
#include <QKeyEvent>
#include <QScrollBar>
#include <QStyleHints>
#include <QToolTip>

#include "quorl/window/cells/CellArrangement.h"
#include "quorl/window/rows/RowKeys.h"
#include "quorl/window/rows/RowsView.h"

namespace quorl {

namespace {

bool isTapping(int key) {
    return key == Qt::Key_Return || key == Qt::Key_Enter || key == Qt::Key_Space ||
           key == Qt::Key_Select;
}

/// Whether a key writes something, rather than orders something.
bool isWriting(const QKeyEvent& event) {
    const bool isOrder =
        event.modifiers() & (Qt::ControlModifier | Qt::AltModifier | Qt::MetaModifier);
    return !isOrder && !event.text().isEmpty() && event.text().front().isPrint();
}

} // namespace

std::optional<NSInteger> RowsView::rowAt(QPointF onViewport) const {
    return layout_.rowAt(onPane(onViewport));
}

void RowsView::wheelEvent(QWheelEvent* event) {
    finder_.stopFindingChecked();
    if (!momentum_.isOver(*event)) {
        QAbstractScrollArea::wheelEvent(event);
    }
}

void RowsView::pressAt(QPointF onViewport) {
    finder_.stopFindingChecked();
    const auto row = rowAt(onViewport);
    if (!momentum_.takesPress() && row && content_->isCurrent()) {
        touch_.press(*row, onViewport);
    }
}

void RowsView::releaseAt(QPointF onViewport) {
    if (const auto row = touch_.release(rowAt(onViewport))) {
        tap(*row);
    }
}

/// Not left to become what a mouse does: of two quick touches the second would be lost.
void RowsView::takeTouch(const QTouchEvent& event) {
    const QPointF place = event.points().front().position();
    if (event.points().size() > 1 || event.type() == QEvent::TouchCancel) {
        touch_.cancel();
    } else if (event.type() == QEvent::TouchBegin) {
        touch_.hover(std::nullopt);
        pressAt(place);
        longPress_.start(QGuiApplication::styleHints()->mousePressAndHoldInterval());
    } else if (event.type() == QEvent::TouchUpdate) {
        touch_.moveTo(place, rowAt(place));
    } else {
        releaseAt(place);
    }
}

void RowsView::askContext(NSInteger row) {
    const auto place = onViewport(layout_.rowRect(row)).center().toPoint();
    Q_EMIT contextAsked(row, viewport()->mapToGlobal(place));
}

void RowsView::contextMenuEvent(QContextMenuEvent* event) {
    const bool isByKey = event->reason() == QContextMenuEvent::Keyboard;
    const auto row = isByKey ? currentRow() : rowAt(event->pos());
    if (row && content_->isCurrent()) {
        touch_.cancel();
        askContext(*row);
    }
}

void RowsView::mousePressEvent(QMouseEvent* event) {
    wasPressed_ = true;
    if (event->button() == Qt::LeftButton) {
        pressAt(event->position());
    }
}

/// The second of two quick presses is one like any other, unless the first opened this view.
void RowsView::mouseDoubleClickEvent(QMouseEvent* event) {
    if (wasPressed_) {
        mousePressEvent(event);
    }
}

void RowsView::mouseMoveEvent(QMouseEvent* event) {
    const auto row = rowAt(event->position());
    touch_.moveTo(event->position(), row);
    touch_.hover(row);
    const QRect strip = scrollBar_->geometry().translated(-viewport()->pos());
    if (strip.contains(event->position().toPoint())) {
        scrollBar_->appear();
    }
}

void RowsView::mouseReleaseEvent(QMouseEvent* event) {
    if (event->button() == Qt::LeftButton) {
        releaseAt(event->position());
    }
}

bool RowsView::viewportEvent(QEvent* event) {
    switch (event->type()) {
    case QEvent::TouchBegin:
    case QEvent::TouchUpdate:
    case QEvent::TouchEnd:
    case QEvent::TouchCancel:
        takeTouch(static_cast<QTouchEvent&>(*event));
        return true;
    case QEvent::ToolTip: {
        const auto& help = static_cast<QHelpEvent&>(*event);
        QToolTip::showText(help.globalPos(), toolTipAt(help.pos()), viewport());
        return true;
    }
    case QEvent::Leave:
        touch_.hover(std::nullopt);
        break;
    default:
        break;
    }
    return QAbstractScrollArea::viewportEvent(event);
}

/// The whole of what is shortened there.
QString RowsView::toolTipAt(QPointF onViewport) const {
    const auto row = rowAt(onViewport);
    const auto cell = row ? content_->cell(*row) : nullptr;
    if (!cell || CellArrangement::of(*cell, layout_.rowRect(*row).size(), screen_.font()).isWhole) {
        return {};
    }
    const RowTexts texts = textsOf(*cell);
    return texts.title + (texts.value.isEmpty() ? QString() : u'\n' + texts.value);
}

NSInteger RowsView::rowsOnPage() const {
    return std::max<NSInteger>(
        static_cast<NSInteger>(viewport()->height() / layout_.rowHeight()) - 1, 1);
}

void RowsView::keyPressEvent(QKeyEvent* event) {
    if (!currentRow() || !takeKey(*event)) {
        QAbstractScrollArea::keyPressEvent(event);
    }
}

bool RowsView::takeKey(const QKeyEvent& event) {
    const NSInteger row = *currentRow();
    if (const auto next = rowByKey(event.key(), row, layout_.rowCount() - 1, rowsOnPage())) {
        setCurrentRow(*next);
    } else if (isTapping(event.key()) &&
               !(typeAhead_.isUnderWay(event.timestamp()) && event.key() == Qt::Key_Space)) {
        setCurrentRow(row);
        tap(row);
    } else if (isWriting(event)) {
        typeAhead(event);
    } else {
        return false;
    }
    return true;
}

void RowsView::focusInEvent(QFocusEvent* event) {
    QAbstractScrollArea::focusInEvent(event);
    updateCurrentRow();
    // Qt tells of the whole view as soon as this is over.
    QMetaObject::invokeMethod(this, "tellFocus", Qt::QueuedConnection);
}

void RowsView::focusOutEvent(QFocusEvent* event) {
    QAbstractScrollArea::focusOutEvent(event);
    updateCurrentRow();
}

} // namespace quorl
