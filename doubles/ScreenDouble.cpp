#include "doubles/ScreenDouble.h"

#include <utility>

namespace quorl {

std::vector<const UILabel*> ScreenDouble::tryLayout(UITableViewCell& cell,
                                                    const CellLayout& layout) {
    layout_ = layout;
    cell.layoutSubviews();
    layout_.reset();
    return std::exchange(labelsSet_, {});
}

CGFloat ScreenDouble::scale() const { return layout_ ? layout_->scale : looks.scale; }

CGSize ScreenDouble::sizeOfText(const UILabel& label) const {
    if (layout_) {
        return {layout_->detailWidth, rowSize().height};
    }
    const auto length = label.text() ? label.text()->size() : 0;
    return length == 0 ? CGSize{} : CGSize{static_cast<CGFloat>(10 * length), 20};
}

void ScreenDouble::layOutLabels(UITableViewCell& cell) {
    if (!layout_) {
        Screen::layOutLabels(cell);
        return;
    }
    cell.textLabel().setFrame(layout_->title);
    cell.detailTextLabel().setFrame(layout_->detail);
    labelsSet_.clear();
}

void ScreenDouble::labelDidSetFrame(UILabel& label) {
    if (layout_) {
        labelsSet_.push_back(&label);
    }
}

void ScreenDouble::controllerWillAppear(UIViewController& /*controller*/, bool animated) {
    recorder_->controllerWillAppear(animated);
}

void ScreenDouble::controllerWillDisappear(UIViewController& /*controller*/, bool animated) {
    recorder_->controllerWillDisappear(animated);
}

void ScreenDouble::specifierWillSetProperty(PSSpecifier& specifier,
                                            const std::optional<std::string>& value,
                                            std::string_view key) {
    recorder_->specifierWillSetProperty(specifier, value, key);
}

void ScreenDouble::listWillReloadSpecifier(PSListController& /*list*/,
                                           const PSSpecifier* specifier) {
    recorder_->listWillReloadSpecifier(specifier);
}

void ScreenDouble::listWillReload(PSListController& /*list*/) { recorder_->listWillReload(); }

void ScreenDouble::listWillShowController(PSListController& /*list*/, PSController* controller,
                                          std::optional<bool> animate) {
    recorder_->listWillShowController(controller, animate);
}

void ScreenDouble::listWillHandleURL(PSListController& /*list*/, const std::string& url) {
    recorder_->listWillHandleURL(url);
}

void ScreenDouble::tableWillReloadData(UITableView& /*table*/) { recorder_->tableWillReloadData(); }

void ScreenDouble::tableWillReloadRows(UITableView& /*table*/,
                                       const std::vector<NSIndexPath>& paths,
                                       UITableViewRowAnimation animation) {
    recorder_->tableWillReloadRows(paths, animation);
}

void ScreenDouble::tableWillDeselectRow(UITableView& /*table*/, const NSIndexPath& path,
                                        bool animated) {
    recorder_->tableWillDeselectRow(path, animated);
}

} // namespace quorl
