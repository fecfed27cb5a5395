#pragma once

#include <gmock/gmock.h>

#include "platform/PreferencesList.h"
#include "runtime/lists/TableView.h"
#include "tests/settings/Pane.h"

namespace quorl::tests {

[[nodiscard]] constexpr NSIndexPath row(NSInteger rowIndex, NSInteger section) {
    return NSIndexPath::indexPathForRow_inSection(rowIndex, section);
}

/// Whether the row of a cell, which is on the screen, carries the checkmark.
[[nodiscard]] bool checked(const std::shared_ptr<UITableViewCell>& cell);

/// One of the choosers as its user meets it.
class TablePaneTest : public PaneTest {
  protected:
    /// Makes a chooser and shows it. The journal begins with its appearance.
    template <class Chooser>
    void show() {
        const auto made = ::create<Chooser>();
        ASSERT_NE(made, nullptr);
        table_ = made;
        controller_ = made.get();
        appear();
    }

    void draw() { TableView::of(*table_).draw(); }

    void setRowsOnScreen(NSInteger count) { TableView::of(*table_).setRowsOnScreen(count); }

    void scrollToRow(NSInteger index) { TableView::of(*table_).scrollToRow(index); }

    /// The user taps a row; nothing is drawn yet.
    void tapRow(const NSIndexPath& path) {
        table_->tableView_didSelectRowAtIndexPath(table_->tableView(), path);
    }

    /// The cell of a row on the screen, or null.
    [[nodiscard]] std::shared_ptr<UITableViewCell> cell(const NSIndexPath& path) const {
        return table_->tableView().cellForRowAtIndexPath(path);
    }

    /// The titles of the rows on the screen, and of those with a checkmark.
    [[nodiscard]] std::vector<std::string> titles() const;
    [[nodiscard]] std::vector<std::string> checkedRows() const;

    /// What each chooser does with the calls of the list framework that are the same for both.
    void expectForwardingToParent();
    void expectAccessors();
    void expectNothingForTheDevice();

    NSInteger rowsOnScreen_ = 20; ///< as the chooser is shown
    std::shared_ptr<UITableViewController> table_;
    PSController* controller_ = nullptr; ///< the same object

  private:
    void appear();
};

} // namespace quorl::tests
