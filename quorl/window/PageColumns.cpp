#include "quorl/window/PageColumns.h"

#include <QEvent>
#include <QPaintEvent>
#include <QPainter>
#include <QStyle>
#include <algorithm>
#include <utility>

#include "quorl/window/look/PaneColors.h"

namespace quorl {

namespace {

constexpr int narrowestFirst = 280;
constexpr int widestFirst = 400;

} // namespace

PageColumns::PageColumns(WindowScreen& screen, QWidget* parent)
    : QWidget(parent), screen_(screen) {}

void PageColumns::add(QWidget* page) {
    page->setParent(this);
    page->hide();
}

void PageColumns::showPages(QWidget* lowest, QWidget* top) {
    QWidget* const left = top_;
    lowest_ = lowest;
    top_ = top;
    placePages();
    if (left && left != top_ && left != lowest_) {
        left->hide();
    }
}

int PageColumns::widthOfFirst() const {
    return std::clamp(width() / 3, narrowestFirst, widestFirst);
}

QRect PageColumns::placeOfLowest() const {
    const QRect first(0, 0, widthOfFirst(), height());
    return hasTwo() ? QStyle::visualRect(layoutDirection(), rect(), first) : rect();
}

QRect PageColumns::placeOfTop() const {
    const QRect second(widthOfFirst(), 0, width() - widthOfFirst(), height());
    return hasTwo() ? QStyle::visualRect(layoutDirection(), rect(), second) : rect();
}

void PageColumns::placePages() {
    if (!top_) {
        return;
    }
    top_->setGeometry(!lowest_ ? rect() : top_ == lowest_ ? placeOfLowest() : placeOfTop());
    top_->show();
    if (lowest_ && lowest_ != top_ && hasTwo()) {
        lowest_->setGeometry(placeOfLowest());
        lowest_->show();
    } else if (lowest_ && lowest_ != top_) {
        hideLowest();
    }
}

/// The focus stays with what is seen.
void PageColumns::hideLowest() {
    if (lowest_->isAncestorOf(window()->focusWidget())) {
        top_->setFocus(Qt::OtherFocusReason);
    }
    lowest_->hide();
}

void PageColumns::resizeEvent(QResizeEvent* event) {
    QWidget::resizeEvent(event);
    const bool isNews = std::exchange(hadTwo_, hasTwo()) != hasTwo();
    placePages();
    if (isNews) {
        Q_EMIT countChanged();
    }
}

void PageColumns::changeEvent(QEvent* event) {
    QWidget::changeEvent(event);
    if (event->type() == QEvent::LayoutDirectionChange) {
        placePages();
    }
}

void PageColumns::paintEvent(QPaintEvent* event) {
    QPainter(this).fillRect(event->rect(), PaneColors::of(palette(), screen_.look()).page);
}

} // namespace quorl
