#pragma once

#include <map>

#include "quorl/content/PaneContent.h"

namespace quorl {

class TableView;

/// The rows of a table pane; only those on the screen have cells.
class TableContent final : public PaneContent {
  public:
    explicit TableContent(std::shared_ptr<UITableViewController> pane) : pane_(std::move(pane)) {}

    [[nodiscard]] UIViewController& pane() const override { return *pane_; }

    void draw(NSInteger firstRow, NSInteger rowsOnScreen) override;

    [[nodiscard]] const std::vector<Section>& sections() const override { return sections_; }

    [[nodiscard]] bool isCurrent() const override;
    [[nodiscard]] std::shared_ptr<UITableViewCell> cell(NSInteger row) const override;
    bool tap(NSInteger row) override;
    [[nodiscard]] std::optional<NSInteger> row(const UITableView& table,
                                               const NSIndexPath& path) const override;
    void showOnly(std::optional<std::vector<NSInteger>> paneRows) override;
    [[nodiscard]] NSInteger paneRowCount() const override;
    [[nodiscard]] std::shared_ptr<UITableViewCell> cellOfPaneRow(NSInteger paneRow) override;

  protected:
    [[nodiscard]] const std::optional<std::vector<NSInteger>>& shownRows() const override;

  private:
    [[nodiscard]] TableView& table() const;
    [[nodiscard]] NSInteger shownWithin(NSInteger first, NSInteger end) const;

    std::shared_ptr<UITableViewController> pane_;
    std::vector<Section> sections_;
    std::map<NSInteger, std::shared_ptr<UITableViewCell>> cells_; ///< those on the screen
};

} // namespace quorl
