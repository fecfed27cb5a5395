#include "quorl/window/cells/CellPainter.h"

#include <QFontMetricsF>

#include "quorl/content/SwitchCell.h"

namespace quorl {

namespace {

constexpr qreal margin = 16;          // of the accessory from the end of the row
constexpr qreal roundingError = 0.01; // of a width that a text just fits into
constexpr QSizeF checkmarkSize(14, 11);
constexpr QSizeF chevronSize(7, 12);
constexpr QSizeF toggleSize(44, 26);

QRectF toRect(const CGRect& frame) {
    return {static_cast<qreal>(frame.x), static_cast<qreal>(frame.y),
            static_cast<qreal>(frame.width), static_cast<qreal>(frame.height)};
}

QColor colorOr(const std::optional<UIColor>& name, const QColor& otherwise) {
    const QColor color = name ? QColor(QString::fromStdString(*name)) : QColor();
    return color.isValid() ? color : otherwise;
}

/// Of a row: the side where reading starts, or the other one.
enum class Side { Start, End };

/// The painting of one cell.
class Painting {
  public:
    Painting(QPainter& painter, const QRectF& place, Qt::LayoutDirection direction)
        : painter_(painter), place_(place), isMirrored_(direction == Qt::RightToLeft) {}

    void label(const UILabel& label, const QColor& color, Side side) {
        const QRectF frame = toRect(label.frame());
        if (!label.text() || frame.width() <= 0) {
            return;
        }
        const QFontMetricsF metrics(painter_.font());
        const QString text = metrics.elidedText(QString::fromStdString(*label.text()),
                                                Qt::ElideRight, frame.width() + roundingError);
        const auto alignment = (side == Side::End) == isMirrored_ ? Qt::AlignLeft : Qt::AlignRight;
        painter_.setPen(color);
        painter_.drawText(onPage(frame),
                          static_cast<int>(alignment | Qt::AlignAbsolute) | Qt::AlignVCenter |
                              Qt::TextSingleLine | Qt::TextDontClip,
                          text);
    }

    /// Ticks the same way in every direction of reading.
    void checkmark(const QColor& color) {
        stroke({{0, 0.5}, {0.36, 1}, {1, 0}}, checkmarkSize, color);
    }

    void toggle(bool isOn, const QColor& onColor, const QColor& offColor) {
        const QRectF track = onPage({place_.width() - margin - toggleSize.width(),
                                     (place_.height() - toggleSize.height()) / 2,
                                     toggleSize.width(), toggleSize.height()});
        const qreal radius = track.height() / 2;
        const bool isKnobRight = isOn != isMirrored_;
        const QPointF knob(isKnobRight ? track.right() - radius : track.left() + radius,
                           track.center().y());
        painter_.save();
        painter_.setRenderHint(QPainter::Antialiasing);
        painter_.setPen(Qt::NoPen);
        painter_.setBrush(isOn ? onColor : offColor);
        painter_.drawRoundedRect(track, radius, radius);
        painter_.setBrush(Qt::white);
        painter_.drawEllipse(knob, radius - 2, radius - 2);
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
            onPage({place_.width() - margin - size.width(), (place_.height() - size.height()) / 2,
                    size.width(), size.height()});
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

void paintCell(QPainter& painter, const UITableViewCell& cell, const QRectF& place,
               const QFont& font, const PaneColors& colors, Qt::LayoutDirection direction) {
    painter.setFont(font);
    painter.setLayoutDirection(Qt::LayoutDirectionAuto); // names read as they are written
    Painting painting(painter, place, direction);
    painting.label(cell.textLabel(), colorOr(cell.textLabel().textColor(), colors.text),
                   Side::Start);
    painting.label(cell.detailTextLabel(),
                   colorOr(cell.detailTextLabel().textColor(), colors.secondary),
                   cell.style() == UITableViewCellStyle::Subtitle ? Side::Start : Side::End);
    if (const auto* toggle = dynamic_cast<const SwitchCell*>(&cell)) {
        painting.toggle(toggle->isOn(), colors.tint, colors.faint);
    } else if (cell.accessoryType() == UITableViewCellAccessoryType::Checkmark) {
        painting.checkmark(colorOr(cell.tintColor(), colors.tint));
    } else if (cell.accessoryType() != UITableViewCellAccessoryType::None) {
        painting.chevron(colors.faint);
    }
}

} // namespace quorl
