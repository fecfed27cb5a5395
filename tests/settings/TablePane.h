#pragma once

#include <gmock/gmock.h>

#include "platform/PreferencesList.h"
#include "runtime/lists/TableView.h"
#include "tests/settings/Pane.h"

namespace quorl::tests {

[[nodiscard]] constexpr NSIndexPath row(NSInteger rowIndex, NSInteger section) {
    return NSIndexPath::indexPathForRow_inSection(rowIndex, section);
}

/// A table with nothing on the screen, which notes what it is asked for among the preferences that
/// are written.
class EmptyTable final : public UITableView {
  public:
    /// `journal`, which outlives the table, has the writes; those until now are left out.
    explicit EmptyTable(Journal& journal) : journal_(journal) { journal_.clear(); }

    [[nodiscard]] std::shared_ptr<UITableViewCell>
    dequeueReusableCellWithIdentifier(std::string_view identifier) override;
    [[nodiscard]] std::shared_ptr<UITableViewCell>
    cellForRowAtIndexPath(const NSIndexPath& path) const override;
    void reloadData() override;
    void reloadRowsAtIndexPaths_withRowAnimation(const std::vector<NSIndexPath>& paths,
                                                 UITableViewRowAnimation animation) override;
    void deselectRowAtIndexPath_animated(const NSIndexPath& path, bool animated) override;

    /// All until now: "cell SECTION.ROW", likewise "reload" and "deselect"; "reload" alone for the
    /// whole table; "write NAME VALUE".
    [[nodiscard]] const std::vector<std::string>& notes() const;

  private:
    void note(const std::string& what, const NSIndexPath& path) const;
    void takeWrites() const;

    Journal& journal_;
    mutable std::vector<std::string> notes_;
};

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
