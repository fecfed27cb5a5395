#include "quorl/content/TableContent.h"

#include <algorithm>
#include <numeric>

#include "runtime/lists/TableView.h"

namespace quorl {

TableView& TableContent::table() const { return TableView::of(*pane_); }

void TableContent::draw(NSInteger firstRow, NSInteger rowsOnScreen) {
    table().setRowsOnScreen(rowsOnScreen);
    table().scrollToRow(firstRow);
    quorl::draw(*pane_);
    sections_.clear();
    NSInteger first = 0;
    for (const NSInteger length : table().sectionLengths()) {
        sections_.push_back({std::nullopt, std::nullopt, shownWithin(first, first + length)});
        first += length;
    }
    cells_.clear();
    NSInteger row = table().firstRow();
    for (const auto& visible : table().visibleRows()) {
        visible.cell->layoutSubviews();
        cells_.emplace(row++, visible.cell);
    }
}

const std::optional<std::vector<NSInteger>>& TableContent::shownRows() const {
    return table().shownRows();
}

/// How many of the pane's rows from `first` to before `end` are shown.
NSInteger TableContent::shownWithin(NSInteger first, NSInteger end) const {
    const auto& shown = shownRows();
    return shown ? std::lower_bound(shown->begin(), shown->end(), end) -
                       std::lower_bound(shown->begin(), shown->end(), first)
                 : end - first;
}

void TableContent::showOnly(std::optional<std::vector<NSInteger>> paneRows) {
    table().showOnly(std::move(paneRows));
}

bool TableContent::isCurrent() const { return table().isLoaded(); }

std::shared_ptr<UITableViewCell> TableContent::cell(NSInteger row) const {
    const auto found = cells_.find(row);
    return found == cells_.end() ? nullptr : found->second;
}

NSInteger TableContent::paneRowCount() const { return table().rowCount(); }

std::shared_ptr<UITableViewCell> TableContent::cellOfPaneRow(NSInteger paneRow) {
    return table().borrowCell(paneRow);
}

bool TableContent::tap(NSInteger row) {
    if (!isCurrent() || !cells_.contains(row)) {
        return false;
    }
    pane_->tableView_didSelectRowAtIndexPath(table(), table().pathOfRow(paneRow(row)));
    return true;
}

std::optional<NSInteger> TableContent::row(const UITableView& table,
                                           const NSIndexPath& path) const {
    const auto& lengths = this->table().sectionLengths();
    if (&table != &pane_->tableView() || path.section < 0 ||
        path.section >= static_cast<NSInteger>(lengths.size())) {
        return std::nullopt;
    }
    return rowOfPaneRow(std::accumulate(lengths.begin(), lengths.begin() + path.section, path.row));
}

} // namespace quorl
