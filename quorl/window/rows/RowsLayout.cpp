#include "quorl/window/rows/RowsLayout.h"

#include <algorithm>
#include <cmath>

namespace quorl {

namespace {

constexpr qreal sectionGap = 22;
constexpr qreal textGap = 8;     // between a card and its title or footer
constexpr qreal textIndent = 16; // as the titles of rows
constexpr qreal bottomMargin = 24;

bool hasText(const std::optional<std::string>& text) { return text && !text->empty(); }

int linesOf(const RowsLayout::Section& section) {
    return (section.title.isEmpty() ? 0 : 1) + static_cast<int>(section.rowCount) +
           (section.footer.isEmpty() ? 0 : 1);
}

} // namespace

RowsLayout::RowsLayout(const std::vector<PaneContent::Section>& sections, qreal left, qreal width,
                       qreal rowHeight, const HeightOfText& heightOfText)
    : left_(left), width_(width), rowHeight_(rowHeight) {
    for (const auto& section : sections) {
        add(section, heightOfText);
    }
    height_ = std::ceil(height_ + bottomMargin);
}

void RowsLayout::add(const PaneContent::Section& content, const HeightOfText& heightOfText) {
    Section section;
    section.firstRow = rowCount();
    section.rowCount = content.rowCount;
    const qreal textLeft = left_ + textIndent;
    const qreal textWidth = std::max<qreal>(width_ - 2 * textIndent, 1);
    const bool isEmpty =
        !hasText(content.title) && content.rowCount == 0 && !hasText(content.footer);
    height_ += isEmpty ? 0 : sectionGap;
    if (hasText(content.title)) {
        const qreal height = std::ceil(heightOfText(LineKind::Title, *content.title, textWidth));
        section.title = {textLeft, height_, textWidth, height};
        height_ += height + textGap;
    }
    if (content.rowCount > 0) {
        const qreal height = rowHeight_ * static_cast<qreal>(content.rowCount);
        section.card = {left_, height_, width_, height};
        height_ += height;
    }
    if (hasText(content.footer)) {
        const qreal height = std::ceil(heightOfText(LineKind::Footer, *content.footer, textWidth));
        section.footer = {textLeft, height_ + textGap, textWidth, height};
        height_ += textGap + height;
    }
    sections_.push_back(section);
}

QRectF RowsLayout::rowRect(const Section& section, NSInteger row) const {
    const auto above = static_cast<qreal>(row - section.firstRow);
    return {left_, section.card.top() + rowHeight_ * above, width_, rowHeight_};
}

QRectF RowsLayout::rowRect(NSInteger row) const {
    for (const Section& section : sections_) {
        if (row >= section.firstRow && row < section.firstRow + section.rowCount) {
            return rowRect(section, row);
        }
    }
    return {};
}

std::optional<NSInteger> RowsLayout::rowAt(QPointF position) const {
    for (const Section& section : sections_) {
        if (section.card.contains(position)) {
            const auto below =
                static_cast<NSInteger>((position.y() - section.card.top()) / rowHeight_);
            return section.firstRow + std::min(below, section.rowCount - 1);
        }
    }
    return std::nullopt;
}

NSInteger RowsLayout::firstRowBelow(qreal y) const {
    for (const Section& section : sections_) {
        if (section.rowCount > 0 && section.card.bottom() > y) {
            const auto above = static_cast<NSInteger>((y - section.card.top()) / rowHeight_);
            return section.firstRow + std::clamp<NSInteger>(above, 0, section.rowCount - 1);
        }
    }
    return std::max<NSInteger>(rowCount() - 1, 0);
}

NSInteger RowsLayout::rowCount() const {
    return sections_.empty() ? 0 : sections_.back().firstRow + sections_.back().rowCount;
}

int RowsLayout::lineCount() const {
    int count = 0;
    for (const Section& section : sections_) {
        count += linesOf(section);
    }
    return count;
}

RowsLayout::Line RowsLayout::line(int index) const {
    for (std::size_t number = 0; number < sections_.size(); ++number) {
        const Section& section = sections_[number];
        if (index >= linesOf(section)) {
            index -= linesOf(section);
            continue;
        }
        if (!section.title.isEmpty() && index-- == 0) {
            return {LineKind::Title, number, 0, section.title};
        }
        if (index < section.rowCount) {
            const NSInteger row = section.firstRow + index;
            return {LineKind::Row, number, row, rowRect(section, row)};
        }
        return {LineKind::Footer, number, 0, section.footer};
    }
    return {};
}

int RowsLayout::lineOfRow(NSInteger row) const {
    int line = 0;
    for (const Section& section : sections_) {
        if (row < section.firstRow + section.rowCount) {
            return line + (section.title.isEmpty() ? 0 : 1) +
                   static_cast<int>(row - section.firstRow);
        }
        line += linesOf(section);
    }
    return line;
}

std::vector<int> RowsLayout::linesBetween(qreal top, qreal bottom) const {
    std::vector<int> lines;
    int first = 0;
    for (const Section& section : sections_) {
        const int title = section.title.isEmpty() ? 0 : 1;
        const auto isSeen = [top, bottom](const QRectF& place) {
            return !place.isEmpty() && place.bottom() > top && place.top() < bottom;
        };
        if (isSeen(section.title)) {
            lines.push_back(first);
        }
        NSInteger row = std::max(firstRowBelow(top), section.firstRow);
        const NSInteger end = section.firstRow + section.rowCount;
        for (; row < end && isSeen(rowRect(section, row)); ++row) {
            lines.push_back(first + title + static_cast<int>(row - section.firstRow));
        }
        if (isSeen(section.footer)) {
            lines.push_back(first + linesOf(section) - 1);
        }
        first += linesOf(section);
    }
    return lines;
}

} // namespace quorl
