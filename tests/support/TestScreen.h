#pragma once

#include "runtime/host/Screen.h"
#include "tests/support/Journal.h"

namespace quorl::tests {

/// A screen of 320 points, ten for each byte of a text, with a line for each thing it is told:
/// "row TITLE" (a row's reload), "footer TEXT", "list" (a list's reload), "table" (a table's),
/// "rows SECTION.ROW...", "deselect SECTION.ROW", "show", "url TEXT" and "frame TEXT X Y W H".
class TestScreen final : public Screen {
  public:
    struct StandardFrames {
        CGRect title;
        CGRect detail;
    };

    explicit TestScreen(Journal& journal) : journal_(journal) {}

    void setScale(CGFloat scale) { scale_ = scale; }

    void setListTextColor(std::optional<UIColor> color) { listTextColor_ = std::move(color); }

    /// What cells are given as their standard layout, in place of the runtime's.
    void setStandardFrames(StandardFrames frames) { standardFrames_ = frames; }

    [[nodiscard]] CGFloat scale() const override { return scale_; }

    [[nodiscard]] UIColor tintColor() const override { return "tint"; }

    [[nodiscard]] std::optional<UIColor> listTextColor() const override { return listTextColor_; }

    [[nodiscard]] CGSize rowSize() const override { return {320, 44}; }

    [[nodiscard]] CGSize sizeOfText(const UILabel& label) const override;
    void layOutLabels(UITableViewCell& cell) override;
    void labelDidSetFrame(UILabel& label) override;
    void specifierWillSetProperty(PSSpecifier& specifier, const std::optional<std::string>& value,
                                  std::string_view key) override;
    void listWillReloadSpecifier(PSListController& list, const PSSpecifier* specifier) override;
    void listWillReload(PSListController& list) override;
    void listWillShowController(PSListController& list, PSController* controller,
                                std::optional<bool> animate) override;
    void listWillHandleURL(PSListController& list, const std::string& url) override;
    void tableWillReloadData(UITableView& table) override;
    void tableWillReloadRows(UITableView& table, const std::vector<NSIndexPath>& paths,
                             UITableViewRowAnimation animation) override;
    void tableWillDeselectRow(UITableView& table, const NSIndexPath& path, bool animated) override;

  private:
    Journal& journal_;
    CGFloat scale_ = 1;
    std::optional<UIColor> listTextColor_;
    std::optional<StandardFrames> standardFrames_;
};

} // namespace quorl::tests
