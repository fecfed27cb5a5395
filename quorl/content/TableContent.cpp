#include "quorl/content/TableContent.h"

#include <numeric>

#include "runtime/lists/TableView.h"

namespace quorl {

TableView& TableContent::table() const { return TableView::of(*pane_); }

void TableContent::draw(NSInteger firstRow, NSInteger rowsOnScreen) {
    table().setRowsOnScreen(rowsOnScreen);
    table().scrollToRow(firstRow);
    quorl::draw(*pane_);
    sections_.clear();
    for (const NSInteger length : table().sectionLengths()) {
        sections_.push_back({std::nullopt, std::nullopt, length});
    }
    cells_.clear();
    NSInteger row = table().firstRow();
    for (const auto& visible : table().visibleRows()) {
        visible.cell->layoutSubviews();
        cells_.emplace(row++, visible.cell);
    }
}

bool TableContent::isCurrent() const { return table().isLoaded(); }

std::shared_ptr<UITableViewCell> TableContent::cell(NSInteger row) const {
    const auto found = cells_.find(row);
    return found == cells_.end() ? nullptr : found->second;
}

std::shared_ptr<UITableViewCell> TableContent::cellAnywhere(NSInteger row) {
    if (auto onScreen = cell(row)) {
        return onScreen;
    }
    return isCurrent() && row >= 0 && row < table().rowCount()
               ? pane_->tableView_cellForRowAtIndexPath(table(), table().pathOfRow(row))
               : nullptr;
}

bool TableContent::tap(NSInteger row) {
    if (!isCurrent() || !cells_.contains(row)) {
        return false;
    }
    pane_->tableView_didSelectRowAtIndexPath(table(), table().pathOfRow(row));
    return true;
}

std::optional<NSInteger> TableContent::row(const UITableView& table,
                                           const NSIndexPath& path) const {
    if (&table != &pane_->tableView() || path.section < 0 ||
        path.section >= static_cast<NSInteger>(sections_.size())) {
        return std::nullopt;
    }
    return std::accumulate(
        sections_.begin(), sections_.begin() + path.section, path.row,
        [](NSInteger sum, const Section& section) { return sum + section.rowCount; });
}

} // namespace quorl
