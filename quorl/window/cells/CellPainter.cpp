#include "quorl/window/cells/CellPainter.h"

#include <QFontMetricsF>

#include "quorl/content/ProgressCell.h"
#include "quorl/content/SwitchCell.h"
#include "quorl/window/cells/CellArrangement.h"

namespace quorl {

namespace {

constexpr QSizeF checkmarkSize(14, 11);
constexpr QSizeF chevronSize(7, 12);
constexpr QSizeF toggleSize(44, 26);
constexpr qreal accessoryGap = 14;
constexpr qreal barHeight = 4;

/// Of a row: the side where reading starts, or the other one.
enum class Side { Start, End };

/// The painting of one cell.
class Painting {
  public:
    Painting(QPainter& painter, const QRectF& place, Qt::LayoutDirection direction)
        : painter_(painter), place_(place), isMirrored_(direction == Qt::RightToLeft) {}

    void text(const CellArrangement::Text& text, const QColor& color, Side side) {
        const qreal height = QFontMetricsF(painter_.font()).height();
        const auto alignment = (side == Side::End) == isMirrored_ ? Qt::AlignLeft : Qt::AlignRight;
        const QRectF place = onPage(text.place);
        qreal top = place.center().y() - height * static_cast<qreal>(text.lines.size()) / 2;
        painter_.setPen(color);
        for (const QString& line : text.lines) {
            painter_.drawText(QRectF(place.left(), top, place.width(), height),
                              static_cast<int>(alignment | Qt::AlignAbsolute) | Qt::AlignVCenter |
                                  Qt::TextSingleLine | Qt::TextDontClip,
                              line);
            top += height;
        }
    }

    /// Ticks the same way in every direction of reading.
    void checkmark(const QColor& color) {
        stroke({{0, 0.5}, {0.36, 1}, {1, 0}}, checkmarkSize, color);
    }

    void toggle(bool isOn, const QColor& color, const QColor& knobColor) {
        const QRectF track = onPage({place_.width() - cellMargin - toggleSize.width(),
                                     (place_.height() - toggleSize.height()) / 2,
                                     toggleSize.width(), toggleSize.height()});
        const qreal radius = track.height() / 2;
        const bool isKnobRight = isOn != isMirrored_;
        const QPointF knob(isKnobRight ? track.right() - radius : track.left() + radius,
                           track.center().y());
        painter_.save();
        painter_.setRenderHint(QPainter::Antialiasing);
        painter_.setPen(Qt::NoPen);
        painter_.setBrush(color);
        painter_.drawRoundedRect(track, radius, radius);
        painter_.setBrush(knobColor);
        painter_.drawEllipse(knob, radius - 2, radius - 2);
        painter_.restore();
    }

    /// Along the bottom of the row; fills up in the direction of reading.
    void bar(double share, const QColor& color, const QColor& ground) {
        const qreal width = place_.width() - 2 * cellMargin;
        const qreal top = place_.height() - 2 * barHeight;
        painter_.save();
        painter_.setRenderHint(QPainter::Antialiasing);
        painter_.setPen(Qt::NoPen);
        for (const auto& [part, brush] : {std::pair(1.0, ground), std::pair(share, color)}) {
            painter_.setBrush(brush);
            painter_.drawRoundedRect(onPage({cellMargin, top, width * part, barHeight}),
                                     barHeight / 2, barHeight / 2);
        }
        painter_.restore();
    }

    void chevron(const QColor& color) {
        const qreal tip = isMirrored_ ? 0 : 1;
        stroke({{1 - tip, 0}, {tip, 0.5}, {1 - tip, 1}}, chevronSize, color);
    }

  private:
    /// A line within the box of the accessory, from 0 to 1 each way.
    void stroke(std::initializer_list<QPointF> points, const QSizeF& size, const QColor& color) {
        const QRectF box =
            onPage({place_.width() - cellMargin - size.width(),
                    (place_.height() - size.height()) / 2, size.width(), size.height()});
        QPolygonF line;
        for (const QPointF& point : points) {
            line << box.topLeft() + QPointF(point.x() * box.width(), point.y() * box.height());
        }
        painter_.save();
        painter_.setRenderHint(QPainter::Antialiasing);
        painter_.setPen(QPen(color, 2, Qt::SolidLine, Qt::RoundCap, Qt::RoundJoin));
        painter_.drawPolyline(line);
        painter_.restore();
    }

    [[nodiscard]] QRectF onPage(QRectF frame) const {
        if (isMirrored_) {
            frame.moveLeft(place_.width() - frame.right());
        }
        return frame.translated(place_.topLeft());
    }

    QPainter& painter_;
    QRectF place_;
    bool isMirrored_;
};

} // namespace

qreal accessoryRoom(const UITableViewCell& cell) {
    if (dynamic_cast<const SwitchCell*>(&cell)) {
        return toggleSize.width() + accessoryGap;
    }
    const bool hasMark = cell.accessoryType() != UITableViewCellAccessoryType::None;
    return hasMark ? checkmarkSize.width() + accessoryGap : 0;
}

void paintCell(QPainter& painter, const UITableViewCell& cell, const QRectF& place,
               const QFont& font, const PaneColors& colors, Qt::LayoutDirection direction) {
    painter.setFont(font);
    painter.setLayoutDirection(Qt::LayoutDirectionAuto); // names read as they are written
    const auto texts = CellArrangement::of(cell, place.size(), font);
    Painting painting(painter, place, direction);
    painting.text(texts.title, colors.named(cell.textLabel().textColor(), colors.text),
                  Side::Start);
    painting.text(texts.value, colors.named(cell.detailTextLabel().textColor(), colors.secondary),
                  texts.isStacked ? Side::Start : Side::End);
    if (const auto* toggle = dynamic_cast<const SwitchCell*>(&cell)) {
        const QColor track = toggle->isOn() ? colors.tint : colors.mark;
        painting.toggle(toggle->isOn(), track, colors.knobOn(track));
    } else if (const auto* progress = dynamic_cast<const ProgressCell*>(&cell)) {
        painting.bar(progress->progress(), colors.tint, colors.separator);
    } else if (cell.accessoryType() == UITableViewCellAccessoryType::Checkmark) {
        painting.checkmark(colors.named(cell.tintColor(), colors.tint));
    } else if (cell.accessoryType() != UITableViewCellAccessoryType::None) {
        painting.chevron(colors.mark);
    }
}

} // namespace quorl
