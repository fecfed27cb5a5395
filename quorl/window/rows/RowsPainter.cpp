#include "quorl/window/rows/RowsPainter.h"

#include <QPainterPath>

#include "quorl/window/cells/CellPainter.h"
#include "quorl/window/cells/WrappedText.h"

namespace quorl {

namespace {

constexpr qreal cardRadius = 10;

} // namespace

void RowsPainter::paint(const QRectF& exposed) {
    for (std::size_t number = 0; number < subject_.layout.sections().size(); ++number) {
        const auto& section = subject_.layout.sections()[number];
        paintTexts(subject_.content.sections()[number], section, exposed);
        if (section.card.intersects(exposed)) {
            paintCard(section, exposed);
        }
    }
}

void RowsPainter::paintTexts(const PaneContent::Section& content,
                             const RowsLayout::Section& section, const QRectF& exposed) {
    if (section.title.intersects(exposed)) {
        painter_.setFont(subject_.screen.headingFont());
        painter_.setPen(subject_.colors.text);
        paintWrapped(painter_, QString::fromStdString(content.title.value_or("")), section.title,
                     direction_);
    }
    if (section.footer.intersects(exposed)) {
        painter_.setFont(subject_.screen.smallFont());
        painter_.setPen(subject_.colors.secondary);
        paintWrapped(painter_, QString::fromStdString(content.footer.value_or("")), section.footer,
                     direction_);
    }
}

void RowsPainter::paintCard(const RowsLayout::Section& section, const QRectF& exposed) {
    // Corners that are far off the screen are beyond what a painter can reckon with.
    const QRectF& whole = section.card;
    const qreal top = std::max(whole.top(), exposed.top() - 4 * cardRadius);
    const qreal bottom = std::min(whole.bottom(), exposed.bottom() + 4 * cardRadius);
    QPainterPath card;
    card.addRoundedRect(QRectF(QPointF(whole.left(), top), QPointF(whole.right(), bottom)),
                        cardRadius, cardRadius);
    painter_.save();
    painter_.setRenderHint(QPainter::Antialiasing);
    painter_.fillPath(card, subject_.colors.card);
    painter_.setClipPath(card, Qt::IntersectClip);
    const NSInteger end = section.firstRow + section.rowCount;
    NSInteger row = std::max(subject_.layout.firstRowBelow(exposed.top()), section.firstRow);
    for (; row < end && subject_.layout.rowRect(row).top() < exposed.bottom(); ++row) {
        paintRow(row, row + 1 == end);
    }
    painter_.setPen(QPen(subject_.colors.edge, 2 * pixel())); // the outer half is clipped away
    painter_.drawPath(card);
    painter_.restore();
}

void RowsPainter::paintRow(NSInteger row, bool isLast) {
    const QRectF place = subject_.layout.rowRect(row);
    const TouchState state = subject_.stateOf(row);
    state.paintGround(painter_, place, 0, subject_.colors);
    if (const auto cell = subject_.content.cell(row)) {
        paintCell(painter_, *cell, place, subject_.screen.font(), subject_.colors, direction_);
    }
    if (!isLast) {
        paintSeparator(place);
    }
    state.paintRing(painter_, place, cardRadius - 2, subject_.colors);
}

void RowsPainter::paintSeparator(const QRectF& row) {
    const qreal left = row.left() + (direction_ == Qt::RightToLeft ? 0 : cellMargin);
    painter_.fillRect(QRectF(left, row.bottom() - pixel(), row.width() - cellMargin, pixel()),
                      subject_.colors.separator);
}

} // namespace quorl
