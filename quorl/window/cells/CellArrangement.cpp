#include "quorl/window/cells/CellArrangement.h"

#include <QFontMetricsF>

#include "quorl/content/SwitchCell.h"
#include "quorl/window/cells/CellPainter.h"
#include "quorl/window/cells/WrappedText.h"

namespace quorl {

namespace {

constexpr qreal gap = 8;              // between a name and its value, at the least
constexpr qreal roundingError = 0.01; // of a width that a text just fits into
constexpr qsizetype mostLines = 2;

QRectF toRect(const CGRect& frame) {
    return {static_cast<qreal>(frame.x), static_cast<qreal>(frame.y),
            static_cast<qreal>(frame.width), static_cast<qreal>(frame.height)};
}

QString textOf(const UILabel& label) { return QString::fromStdString(label.text().value_or("")); }

class Arranging {
  public:
    Arranging(const UITableViewCell& cell, const QSizeF& row, const QFont& font)
        : cell_(cell),
          row_(row),
          font_(font),
          metrics_(font),
          name_(textOf(cell.textLabel())),
          value_(textOf(cell.detailTextLabel())),
          end_(row.width() - cellMargin - accessoryRoom(cell)) {}

    CellArrangement arrange() {
        if (value_.isEmpty()) {
            alone();
        } else if (cell_.style() == UITableViewCellStyle::Subtitle || !sideBySide()) {
            stacked();
        }
        return result_;
    }

  private:
    [[nodiscard]] bool fits(const QString& text, qreal width) const {
        return metrics_.horizontalAdvance(text) <= width + roundingError;
    }

    [[nodiscard]] QString shortened(const QString& text, qreal width) {
        const bool isTooLong = !fits(text, width);
        result_.isWhole = result_.isWhole && !isTooLong;
        return isTooLong ? metrics_.elidedText(text, Qt::ElideRight, width) : text;
    }

    void alone() {
        const qreal left = toRect(cell_.textLabel().frame()).left();
        result_.title.place = {left, 0, std::max<qreal>(end_ - left, 0), row_.height()};
        const qreal width = result_.title.place.width();
        QStringList lines =
            fits(name_, width) ? QStringList{name_} : wrappedLines(name_, font_, width);
        if (lines.size() > mostLines) {
            const auto taken = lines.front().size();
            lines = {lines.front(), shortened(name_.mid(taken).trimmed(), width)};
        }
        result_.title.lines = lines;
    }

    /// Where the cell has them; false where they do not fit there.
    bool sideBySide() {
        const QRectF value = toRect(cell_.detailTextLabel().frame());
        QRectF title = toRect(cell_.textLabel().frame());
        title.setRight(std::min(title.right(), value.left() - gap));
        if (!fits(value_, value.width())) {
            return false;
        }
        if (!fits(name_, title.width())) {
            const auto lines = linesOfWholeWords(name_, font_, title.width());
            if (!lines || lines->size() > mostLines) {
                return false;
            }
            result_.title = {*lines, {title.left(), 0, title.width(), row_.height()}};
        } else {
            result_.title = {{name_}, title};
        }
        result_.value = {{value_}, value};
        return true;
    }

    void stacked() {
        const qreal height = metrics_.height();
        const qreal top = (row_.height() - 2 * height) / 2;
        const qreal width = std::max<qreal>(end_ - cellMargin, 0);
        result_.isStacked = true;
        result_.title = {{shortened(name_, width)}, {cellMargin, top, width, height}};
        result_.value = {{shortened(value_, width)}, {cellMargin, top + height, width, height}};
    }

    const UITableViewCell& cell_;
    const QSizeF row_;
    const QFont& font_;
    const QFontMetricsF metrics_;
    const QString name_;
    const QString value_;
    const qreal end_; ///< where the room for texts ends
    CellArrangement result_;
};

} // namespace

CellArrangement CellArrangement::of(const UITableViewCell& cell, const QSizeF& row,
                                    const QFont& font) {
    return Arranging(cell, row, font).arrange();
}

} // namespace quorl
