#pragma once

#include "runtime/lists/NavigationController.h"

namespace quorl {

/// What a pane shows, as rows in sections, whichever kind of pane it is. Rows are counted over all
/// sections, and only those that are shown. Knows no toolkit; main thread.
class PaneContent {
  public:
    struct Section {
        std::optional<std::string> title;  ///< above the rows; null for none
        std::optional<std::string> footer; ///< below the rows; null for none
        NSInteger rowCount = 0;            ///< of the rows that are shown
    };

    /// The content of `pane`, never null. `navigation` opens what a tap on a row opens, and
    /// outlives the content.
    [[nodiscard]] static std::unique_ptr<PaneContent>
    of(const std::shared_ptr<UIViewController>& pane, NavigationController& navigation);

    PaneContent() = default;
    PaneContent(const PaneContent&) = delete;
    PaneContent& operator=(const PaneContent&) = delete;
    virtual ~PaneContent() = default;

    [[nodiscard]] virtual UIViewController& pane() const = 0;

    /// Draws the pane, with `rowsOnScreen` rows on the screen of which `firstRow` is the first as
    /// far as the number of rows allows, and lays out their cells.
    virtual void draw(NSInteger firstRow, NSInteger rowsOnScreen) = 0;

    /// As last drawn. A section of which no row is shown has neither title nor footer, where not
    /// all rows are.
    [[nodiscard]] virtual const std::vector<Section>& sections() const = 0;

    /// Whether the pane still has the rows that were drawn last. Where it has not, nobody has seen
    /// its rows, and none can be tapped before the next drawing.
    [[nodiscard]] virtual bool isCurrent() const = 0;

    /// The cell of a row as last drawn; null for a row that is not on the screen.
    [[nodiscard]] virtual std::shared_ptr<UITableViewCell> cell(NSInteger row) const = 0;

    /// The cell of any row; null for no such row, and off the screen while the rows are not
    /// current. That of a row off the screen holds until the content is asked for another.
    [[nodiscard]] std::shared_ptr<UITableViewCell> cellAnywhere(NSInteger row);

    /// What a finger on a row does. It reaches what was last drawn or nothing: false where the rows
    /// are not current or this one is not on the screen.
    virtual bool tap(NSInteger row) = 0;

    /// The row by which the pane right above this one was opened, or null where that is none of the
    /// rows that are shown.
    [[nodiscard]] virtual std::optional<NSInteger> openRow() const { return std::nullopt; }

    /// The row at `path` of `table`, or null where that is another pane's table, or not shown.
    [[nodiscard]] virtual std::optional<NSInteger> row(const UITableView& table,
                                                       const NSIndexPath& path) const = 0;

    [[nodiscard]] NSInteger rowCount() const;

    /// The next drawing shows only these of the pane's rows, in rising order; null for all. The
    /// pane does not notice.
    virtual void showOnly(std::optional<std::vector<NSInteger>> paneRows) = 0;

    /// How many rows the pane has, shown or not, as last drawn.
    [[nodiscard]] virtual NSInteger paneRowCount() const = 0;

    /// Which of the pane's rows a row is.
    [[nodiscard]] NSInteger paneRow(NSInteger row) const;

    /// The row that a row of the pane is, or null where that is not shown.
    [[nodiscard]] std::optional<NSInteger> rowOfPaneRow(NSInteger paneRow) const;

    /// The cell of any of the pane's rows, as `cellAnywhere`.
    [[nodiscard]] virtual std::shared_ptr<UITableViewCell> cellOfPaneRow(NSInteger paneRow) = 0;

  protected:
    /// What `showOnly` left of the pane's rows.
    [[nodiscard]] virtual const std::optional<std::vector<NSInteger>>& shownRows() const = 0;
};

} // namespace quorl
