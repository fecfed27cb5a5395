#pragma once

#include <map>
#include <optional>

#include "platform/UserInterface.h"

namespace quorl {

/// The table of a table view controller, as every host shows it. The host says which rows fit on
/// the screen and when to draw; positions on the screen are its own business.
class TableView : public UITableView {
  public:
    struct VisibleRow {
        NSIndexPath path;
        std::shared_ptr<UITableViewCell> cell;
    };

    /// `controller` owns the table and answers for its rows.
    explicit TableView(UITableViewController& controller) : controller_(controller) {}

    /// The table of a controller.
    [[nodiscard]] static TableView& of(const UITableViewController& controller);

    [[nodiscard]] std::shared_ptr<UITableViewCell>
    dequeueReusableCellWithIdentifier(std::string_view identifier) override;
    [[nodiscard]] std::shared_ptr<UITableViewCell>
    cellForRowAtIndexPath(const NSIndexPath& path) const override;
    void reloadData() override;
    void reloadRowsAtIndexPaths_withRowAnimation(const std::vector<NSIndexPath>& paths,
                                                 UITableViewRowAnimation animation) override;
    void deselectRowAtIndexPath_animated(const NSIndexPath& path, bool animated) override;

    /// Whether the table is on the screen; it is drawn only there.
    void setOnScreen(bool onScreen) { onScreen_ = onScreen; }

    /// Whether the rows are still those that were drawn last: false from `reloadData` to the next
    /// drawing.
    [[nodiscard]] bool isLoaded() const { return loaded_; }

    /// How many rows the screen shows at once.
    void setRowsOnScreen(NSInteger count);

    /// Makes the row at `index`, counted over all sections and only over those that are shown, the
    /// first on the screen, as far as the table's length allows. The position is kept over reloads.
    void scrollToRow(NSInteger index);

    /// Has only these rows shown, counted over all sections, in rising order; null for all. The
    /// controller need not know: rows keep their places in the table. A reload leaves out those
    /// that the table has no more.
    void showOnly(std::optional<std::vector<NSInteger>> rows);

    /// The rows that `showOnly` left, or null for all.
    [[nodiscard]] const std::optional<std::vector<NSInteger>>& shownRows() const {
        return shownRows_;
    }

    /// Asks the controller for what changed since the last drawing and for the rows that have come
    /// on the screen; rows that have left it give their cells back for use by others. Does nothing
    /// off the screen.
    void draw();

    /// The rows on the screen as last drawn, from top to bottom.
    [[nodiscard]] std::vector<VisibleRow> visibleRows() const;

    /// The number of rows of each section, as last drawn.
    [[nodiscard]] const std::vector<NSInteger>& sectionLengths() const { return sectionLengths_; }

    /// The number of rows of all sections, and the place of one counted over all, as last drawn.
    [[nodiscard]] NSInteger rowCount() const { return rowCount_; }

    [[nodiscard]] NSIndexPath pathOfRow(NSInteger index) const;

    /// The first row on the screen, counted as for `scrollToRow`, as last drawn.
    [[nodiscard]] NSInteger firstRow() const { return firstRow_; }

    /// What a row says that is not on the screen; null for no such row, and while the rows are not
    /// loaded. The cell is the caller's until the table is next asked for anything.
    [[nodiscard]] std::shared_ptr<UITableViewCell> borrowCell(NSInteger index);

  private:
    [[nodiscard]] NSInteger indexOf(const NSIndexPath& path) const;
    void loadSections();
    void recycleAllBut(const std::vector<NSInteger>& rows);
    [[nodiscard]] std::vector<NSInteger> rowsToDraw();
    void recycle(std::shared_ptr<UITableViewCell> cell);

    UITableViewController& controller_;
    bool onScreen_ = false;
    bool loaded_ = false;
    NSInteger rowsOnScreen_ = 0;
    NSInteger wantedFirstRow_ = 0;
    NSInteger firstRow_ = 0;
    NSInteger rowCount_ = 0;
    std::vector<NSInteger> sectionLengths_;
    std::optional<std::vector<NSInteger>> shownRows_;
    std::map<NSInteger, std::shared_ptr<UITableViewCell>> cells_; ///< by place over all sections
    std::vector<NSInteger> staleRows_;                            ///< to be asked for again
    std::multimap<std::string, std::shared_ptr<UITableViewCell>, std::less<>> reusable_;
};

} // namespace quorl
