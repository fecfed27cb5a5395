#pragma once

#include "quorl/content/PaneContent.h"

namespace quorl {

/// The rows of a list pane, all that are shown on the screen. A pane that is no list has none.
class ListContent final : public PaneContent {
  public:
    ListContent(std::shared_ptr<UIViewController> pane, NavigationController& navigation)
        : pane_(std::move(pane)), navigation_(navigation) {}

    [[nodiscard]] UIViewController& pane() const override { return *pane_; }

    void draw(NSInteger firstRow, NSInteger rowsOnScreen) override;

    [[nodiscard]] const std::vector<Section>& sections() const override { return sections_; }

    [[nodiscard]] bool isCurrent() const override;
    [[nodiscard]] std::shared_ptr<UITableViewCell> cell(NSInteger row) const override;
    bool tap(NSInteger row) override;
    [[nodiscard]] std::optional<NSInteger> openRow() const override;
    [[nodiscard]] std::optional<NSInteger> row(const UITableView& table,
                                               const NSIndexPath& path) const override;
    void showOnly(std::optional<std::vector<NSInteger>> paneRows) override;
    [[nodiscard]] NSInteger paneRowCount() const override;
    [[nodiscard]] std::shared_ptr<UITableViewCell> cellOfPaneRow(NSInteger paneRow) override;

  protected:
    [[nodiscard]] const std::optional<std::vector<NSInteger>>& shownRows() const override {
        return shownRows_;
    }

  private:
    struct Row {
        std::shared_ptr<PSSpecifier> specifier;
        std::shared_ptr<UITableViewCell> cell;
    };

    [[nodiscard]] const Row* rowAt(NSInteger paneRow) const;
    void leaveOutHidden();
    [[nodiscard]] bool isOpen(const PSSpecifier& row) const;
    void open(const std::shared_ptr<PSSpecifier>& row);

    std::shared_ptr<UIViewController> pane_;
    NavigationController& navigation_;
    std::vector<Section> sections_;
    std::vector<Row> rows_; ///< all of the pane
    std::optional<std::vector<NSInteger>> shownRows_;
};

} // namespace quorl
