#pragma once

#include "quorl-script/Trace.h"
#include "runtime/host/Screen.h"

namespace quorl {

/// The looks of a script's screen.
struct Looks {
    NSInteger rows = 12; ///< rows of a table on the screen at once
    CGFloat scale = 2;
    std::optional<UIColor> textColor;
    UIColor tintColor = "tint";
};

/// One layout of a cell, as a script wants it tried.
struct CellLayout {
    CGRect title; ///< what the standard layout gives
    CGRect detail;
    CGFloat detailWidth = 0; ///< what the detail text needs
    CGFloat scale = 1;
};

/// A screen that nobody looks at, with a trace of what panes ask of their lists and tables. Main
/// thread.
class ScriptedScreen final : public Screen {
  public:
    explicit ScriptedScreen(std::shared_ptr<Trace> trace) : trace_(std::move(trace)) {}

    [[nodiscard]] const Looks& looks() const { return looks_; }

    void setLooks(Looks looks) { looks_ = std::move(looks); }

    /// Has `cell` lay itself out under the conditions of `layout`. Gives the labels back whose
    /// frames were set after the standard layout, in order.
    [[nodiscard]] std::vector<const UILabel*> tryLayout(UITableViewCell& cell,
                                                        const CellLayout& layout);

    [[nodiscard]] CGFloat scale() const override;

    [[nodiscard]] UIColor tintColor() const override { return looks_.tintColor; }

    [[nodiscard]] std::optional<UIColor> listTextColor() const override { return looks_.textColor; }

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
    std::shared_ptr<Trace> trace_;
    Looks looks_;
    std::optional<CellLayout> layout_; ///< null but during `tryLayout`
    std::vector<const UILabel*> labelsSet_;
};

} // namespace quorl
