#pragma once

#include "quorl/content/PaneContent.h"

namespace quorl {

/// The rows of a list pane, all of them on the screen. A pane that is no list has none.
class ListContent final : public PaneContent {
  public:
    ListContent(std::shared_ptr<UIViewController> pane, NavigationController& navigation)
        : pane_(std::move(pane)), navigation_(navigation) {}

    [[nodiscard]] UIViewController& pane() const override { return *pane_; }

    void draw(NSInteger firstRow, NSInteger rowsOnScreen) override;

    [[nodiscard]] const std::vector<Section>& sections() const override { return sections_; }

    [[nodiscard]] bool isCurrent() const override;
    [[nodiscard]] std::shared_ptr<UITableViewCell> cell(NSInteger row) const override;
    [[nodiscard]] std::shared_ptr<UITableViewCell> cellAnywhere(NSInteger row) override;
    bool tap(NSInteger row) override;
    [[nodiscard]] std::optional<NSInteger> row(const UITableView& table,
                                               const NSIndexPath& path) const override;

  private:
    struct Row {
        std::shared_ptr<PSSpecifier> specifier;
        std::shared_ptr<UITableViewCell> cell;
    };

    [[nodiscard]] const Row* rowAt(NSInteger row) const;

    std::shared_ptr<UIViewController> pane_;
    NavigationController& navigation_;
    std::vector<Section> sections_;
    std::vector<Row> rows_;
};

} // namespace quorl
