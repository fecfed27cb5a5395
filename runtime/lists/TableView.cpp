#include "runtime/lists/TableView.h"

#include <algorithm>
#include <numeric>

#include "runtime/host/Host.h"
#include "runtime/host/Screen.h"

namespace quorl {

namespace {

Screen& screen() { return Host::required().screen(); }

} // namespace

TableView& TableView::of(const UITableViewController& controller) {
    return static_cast<TableView&>(controller.tableView());
}

std::shared_ptr<UITableViewCell>
TableView::dequeueReusableCellWithIdentifier(std::string_view identifier) {
    const auto found = reusable_.find(identifier);
    if (found == reusable_.end()) {
        return nullptr;
    }
    auto cell = std::move(found->second);
    reusable_.erase(found);
    return cell;
}

std::shared_ptr<UITableViewCell> TableView::cellForRowAtIndexPath(const NSIndexPath& path) const {
    const auto found = loaded_ ? cells_.find(indexOf(path)) : cells_.end();
    return found == cells_.end() ? nullptr : found->second;
}

void TableView::reloadData() {
    screen().tableWillReloadData(*this);
    loaded_ = false;
    staleRows_.clear();
    recycleAllBut({});
}

void TableView::reloadRowsAtIndexPaths_withRowAnimation(const std::vector<NSIndexPath>& paths,
                                                        UITableViewRowAnimation animation) {
    screen().tableWillReloadRows(*this, paths, animation);
    for (const NSIndexPath& path : paths) {
        staleRows_.push_back(indexOf(path));
    }
}

void TableView::deselectRowAtIndexPath_animated(const NSIndexPath& path, bool animated) {
    screen().tableWillDeselectRow(*this, path, animated);
}

void TableView::setRowsOnScreen(NSInteger count) { rowsOnScreen_ = std::max<NSInteger>(count, 0); }

void TableView::scrollToRow(NSInteger index) { wantedFirstRow_ = std::max<NSInteger>(index, 0); }

void TableView::draw() {
    if (!onScreen_) {
        return;
    }
    if (!loaded_) {
        loadSections();
    }
    const auto rows = rowsToDraw();
    recycleAllBut(rows);
    for (const NSInteger row : std::exchange(staleRows_, {})) {
        if (auto stale = cells_.extract(row)) {
            recycle(std::move(stale.mapped()));
        }
    }
    for (const NSInteger row : rows) {
        if (!cells_.contains(row)) {
            cells_[row] = controller_.tableView_cellForRowAtIndexPath(*this, pathOfRow(row));
        }
    }
}

std::vector<NSInteger> TableView::rowsToDraw() {
    const NSInteger count = shownRows_ ? static_cast<NSInteger>(shownRows_->size()) : rowCount_;
    firstRow_ =
        std::clamp<NSInteger>(wantedFirstRow_, 0, std::max<NSInteger>(count - rowsOnScreen_, 0));
    wantedFirstRow_ = firstRow_;
    std::vector<NSInteger> rows;
    for (NSInteger place = firstRow_; place < std::min(firstRow_ + rowsOnScreen_, count); ++place) {
        rows.push_back(shownRows_ ? (*shownRows_)[static_cast<std::size_t>(place)] : place);
    }
    return rows;
}

void TableView::showOnly(std::optional<std::vector<NSInteger>> rows) {
    shownRows_ = std::move(rows);
}

std::shared_ptr<UITableViewCell> TableView::borrowCell(NSInteger index) {
    if (!loaded_ || index < 0 || index >= rowCount_) {
        return nullptr;
    }
    auto cell = controller_.tableView_cellForRowAtIndexPath(*this, pathOfRow(index));
    recycle(cell);
    return cell;
}

std::vector<TableView::VisibleRow> TableView::visibleRows() const {
    std::vector<VisibleRow> rows;
    for (const auto& [row, cell] : cells_) {
        rows.push_back({pathOfRow(row), cell});
    }
    return rows;
}

NSIndexPath TableView::pathOfRow(NSInteger index) const {
    NSInteger section = 0;
    for (const NSInteger length : sectionLengths_) {
        if (index < length) {
            break;
        }
        index -= length;
        ++section;
    }
    return {section, index};
}

/// A place that no row has for a path outside the table.
NSInteger TableView::indexOf(const NSIndexPath& path) const {
    const auto sections = static_cast<NSInteger>(sectionLengths_.size());
    if (path.section < 0 || path.section >= sections || path.row < 0 ||
        path.row >= sectionLengths_[static_cast<std::size_t>(path.section)]) {
        return -1;
    }
    return std::accumulate(sectionLengths_.begin(), sectionLengths_.begin() + path.section,
                           path.row);
}

void TableView::loadSections() {
    const NSInteger sections = controller_.numberOfSectionsInTableView(*this);
    sectionLengths_.clear();
    for (NSInteger section = 0; section < sections; ++section) {
        sectionLengths_.push_back(controller_.tableView_numberOfRowsInSection(*this, section));
    }
    rowCount_ = std::accumulate(sectionLengths_.begin(), sectionLengths_.end(), NSInteger{0});
    if (shownRows_) {
        std::erase_if(*shownRows_, [this](NSInteger row) { return row >= rowCount_; });
    }
    loaded_ = true;
}

void TableView::recycleAllBut(const std::vector<NSInteger>& rows) {
    for (auto row = cells_.begin(); row != cells_.end();) {
        if (std::binary_search(rows.begin(), rows.end(), row->first)) {
            ++row;
        } else {
            recycle(std::move(row->second));
            row = cells_.erase(row);
        }
    }
}

void TableView::recycle(std::shared_ptr<UITableViewCell> cell) {
    if (cell && !cell->reuseIdentifier().empty()) {
        std::string identifier = cell->reuseIdentifier();
        reusable_.emplace(std::move(identifier), std::move(cell));
    }
}

} // namespace quorl
