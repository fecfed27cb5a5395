#pragma once

#include "quorl/app/CompanionHost.h"
#include "quorl/window/rows/RowsView.h"

namespace quorl::tests {

/// A table of two sections: names, and one row "None" below them.
class NamedTable final : public UITableViewController {
  public:
    NSInteger numberOfSectionsInTableView(UITableView& tableView) override;
    NSInteger tableView_numberOfRowsInSection(UITableView& tableView, NSInteger section) override;
    std::shared_ptr<UITableViewCell>
    tableView_cellForRowAtIndexPath(UITableView& tableView, const NSIndexPath& path) override;
    void tableView_didSelectRowAtIndexPath(UITableView& tableView,
                                           const NSIndexPath& path) override;

    [[nodiscard]] std::string nameAt(const NSIndexPath& path) const;

    std::vector<std::string> names;
    std::string checked = "None";
    std::string status;                ///< of the one that is checked
    std::vector<std::string> selected; ///< what was tapped, in that order
};

/// A view of such a table, phone-sized, in which nothing moves by itself.
class ShownTable {
  public:
    explicit ShownTable(std::vector<std::string> names, const std::string& checked = "None");
    ShownTable(const ShownTable&) = delete;
    ShownTable& operator=(const ShownTable&) = delete;
    ~ShownTable();

    [[nodiscard]] NamedTable& table() { return *table_; }

    [[nodiscard]] RowsView& view() { return *view_; }

    [[nodiscard]] WindowScreen& screen() { return screen_; }

    /// Gives the table other names, as another program does while the view is open.
    void reloadWith(std::vector<std::string> names);

    /// What the row that keys act on is called.
    [[nodiscard]] std::string currentName();

    /// The names on the screen that are seen whole, from top to bottom.
    [[nodiscard]] std::vector<std::string> namesOnScreen();

    /// The row of a name.
    [[nodiscard]] NSInteger rowOf(const std::string& name);

    void press(int key, Qt::KeyboardModifiers modifiers = Qt::NoModifier);

    /// Types letters, `time` milliseconds after the start of the session.
    void type(const QString& letters, std::uint64_t time);

  private:
    WindowScreen screen_;
    Notices notices_;
    std::shared_ptr<CompanionHost> host_;
    std::shared_ptr<NavigationController> navigation_;
    std::shared_ptr<NamedTable> table_;
    std::unique_ptr<RowsView> view_;
};

/// `count` names in alphabetical order: "Name 1000", "Name 1001" and so on.
[[nodiscard]] std::vector<std::string> manyNames(int count);

} // namespace quorl::tests
