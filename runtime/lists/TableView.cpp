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
    recycleRowsOutside(0, 0);
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
    firstRow_ = std::clamp<NSInteger>(wantedFirstRow_, 0,
                                      std::max<NSInteger>(rowCount_ - rowsOnScreen_, 0));
    wantedFirstRow_ = firstRow_;
    const NSInteger end = std::min(firstRow_ + rowsOnScreen_, rowCount_);
    recycleRowsOutside(firstRow_, end);
    for (const NSInteger row : std::exchange(staleRows_, {})) {
        if (auto stale = cells_.extract(row)) {
            recycle(std::move(stale.mapped()));
        }
    }
    for (NSInteger row = firstRow_; row < end; ++row) {
        if (!cells_.contains(row)) {
            cells_[row] = controller_.tableView_cellForRowAtIndexPath(*this, pathOfRow(row));
        }
    }
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
    loaded_ = true;
}

void TableView::recycleRowsOutside(NSInteger first, NSInteger end) {
    for (auto row = cells_.begin(); row != cells_.end();) {
        if (row->first < first || row->first >= end) {
            recycle(std::move(row->second));
            row = cells_.erase(row);
        } else {
            ++row;
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
