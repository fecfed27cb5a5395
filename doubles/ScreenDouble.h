#pragma once

#include "doubles/CallRecorder.h"
#include "runtime/host/Screen.h"

namespace quorl {

/// What can be chosen about a screen.
struct Looks {
    NSInteger rows = 12; ///< rows of a table on the screen at once
    CGFloat scale = 2;
    std::optional<UIColor> textColor;
    UIColor tintColor = "tint";
};

/// One layout of a cell, as it is to be tried.
struct CellLayout {
    CGRect title; ///< what the standard layout gives
    CGRect detail;
    CGFloat detailWidth = 0; ///< what the detail text needs
    CGFloat scale = 1;
};

/// A screen of 320 points that nobody looks at, ten points for each byte of a text. Main thread.
class ScreenDouble final : public Screen {
  public:
    explicit ScreenDouble(std::shared_ptr<CallRecorder> recorder)
        : recorder_(std::move(recorder)) {}

    Looks looks;

    /// Has `cell` lay itself out under the conditions of `layout`. Gives the labels back whose
    /// frames were set after the standard layout, in order.
    [[nodiscard]] std::vector<const UILabel*> tryLayout(UITableViewCell& cell,
                                                        const CellLayout& layout);

    [[nodiscard]] CGFloat scale() const override;

    [[nodiscard]] UIColor tintColor() const override { return looks.tintColor; }

    [[nodiscard]] std::optional<UIColor> listTextColor() const override { return looks.textColor; }

    [[nodiscard]] CGSize rowSize() const override { return {320, 44}; }

    [[nodiscard]] CGSize sizeOfText(const UILabel& label) const override;
    void layOutLabels(UITableViewCell& cell) override;
    void labelDidSetFrame(UILabel& label) override;
    void controllerWillAppear(UIViewController& controller, bool animated) override;
    void controllerWillDisappear(UIViewController& controller, bool animated) override;
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
    std::shared_ptr<CallRecorder> recorder_;
    std::optional<CellLayout> layout_; ///< null but during `tryLayout`
    std::vector<const UILabel*> labelsSet_;
};

} // namespace quorl
