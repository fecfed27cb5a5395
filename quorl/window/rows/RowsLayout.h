#pragma once

#include <QRectF>
#include <QString>
#include <functional>
#include <optional>
#include <vector>

#include "quorl/content/PaneContent.h"

namespace quorl {

/// Where the titles, rows and footers of a pane are, in points from its top left corner, in the
/// mirror image of which right-to-left languages read. Rows are all of one height, so that a
/// hundred thousand take no more than one.
class RowsLayout {
  public:
    enum class LineKind { Title, Row, Footer };

    /// One thing that is read: a title, a row or a footer.
    struct Line {
        LineKind kind = LineKind::Row;
        std::size_t section = 0;
        NSInteger row = 0; ///< of a row
        QRectF rect;

        [[nodiscard]] bool operator==(const Line&) const = default;
    };

    struct Section {
        QRectF title; ///< empty for none
        QRectF card;  ///< around the rows; empty for none
        QRectF footer;
        NSInteger firstRow = 0;
        NSInteger rowCount = 0;

        [[nodiscard]] bool operator==(const Section&) const = default;
    };

    /// Gives the height of a title or a footer that is wrapped to a width.
    using HeightOfText = std::function<qreal(LineKind kind, const std::string& text, qreal width)>;

    /// An empty layout.
    RowsLayout() = default;

    /// `left` and `width` are those of the cards.
    RowsLayout(const std::vector<PaneContent::Section>& sections, qreal left, qreal width,
               qreal rowHeight, const HeightOfText& heightOfText);

    [[nodiscard]] bool operator==(const RowsLayout&) const = default;

    [[nodiscard]] const std::vector<Section>& sections() const { return sections_; }

    [[nodiscard]] qreal height() const { return height_; }

    [[nodiscard]] qreal rowHeight() const { return rowHeight_; }

    /// Of the cards.
    [[nodiscard]] qreal width() const { return width_; }

    /// The place of a row; empty for no such row.
    [[nodiscard]] QRectF rowRect(NSInteger row) const;

    /// The row at a place, or null between rows.
    [[nodiscard]] std::optional<NSInteger> rowAt(QPointF position) const;

    /// The first row that reaches below `y`; the last one of all where none does.
    [[nodiscard]] NSInteger firstRowBelow(qreal y) const;

    [[nodiscard]] NSInteger rowCount() const;

    [[nodiscard]] int lineCount() const;

    /// `index` is below `lineCount`.
    [[nodiscard]] Line line(int index) const;

    /// The line of a row.
    [[nodiscard]] int lineOfRow(NSInteger row) const;

    /// The lines that are seen between two heights, from top to bottom.
    [[nodiscard]] std::vector<int> linesBetween(qreal top, qreal bottom) const;

  private:
    [[nodiscard]] QRectF rowRect(const Section& section, NSInteger row) const;
    void add(const PaneContent::Section& content, const HeightOfText& heightOfText);

    std::vector<Section> sections_;
    qreal left_ = 0;
    qreal width_ = 0;
    qreal rowHeight_ = 0;
    qreal height_ = 0;
};

} // namespace quorl
