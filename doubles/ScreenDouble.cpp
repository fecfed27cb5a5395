#include "doubles/ScreenDouble.h"

#include <utility>

#include "quorl-script/Naming.h"

namespace quorl {

namespace {

Json pathOf(const NSIndexPath& path) { return Json::array({path.section, path.row}); }

} // namespace

std::vector<const UILabel*> ScriptedScreen::tryLayout(UITableViewCell& cell,
                                                      const CellLayout& layout) {
    layout_ = layout;
    cell.layoutSubviews();
    layout_.reset();
    return std::exchange(labelsSet_, {});
}

CGFloat ScriptedScreen::scale() const { return layout_ ? layout_->scale : looks_.scale; }

CGSize ScriptedScreen::sizeOfText(const UILabel& /*label*/) const {
    return {layout_ ? layout_->detailWidth : 0, rowSize().height};
}

void ScriptedScreen::layOutLabels(UITableViewCell& cell) {
    if (!layout_) {
        Screen::layOutLabels(cell);
        return;
    }
    cell.textLabel().setFrame(layout_->title);
    cell.detailTextLabel().setFrame(layout_->detail);
    labelsSet_.clear();
}

void ScriptedScreen::labelDidSetFrame(UILabel& label) {
    if (layout_) {
        labelsSet_.push_back(&label);
    }
}

void ScriptedScreen::specifierWillSetProperty(PSSpecifier& specifier,
                                              const std::optional<std::string>& value,
                                              std::string_view key) {
    trace_->record("PSSpecifier", "setProperty:forKey:", textOf(specifier.name()), textOf(value),
                   key);
}

void ScriptedScreen::listWillReloadSpecifier(PSListController& /*list*/,
                                             const PSSpecifier* specifier) {
    trace_->record("PSListController",
                   "reloadSpecifier:", specifier ? textOf(specifier->name()) : Json(nullptr));
}

void ScriptedScreen::listWillReload(PSListController& /*list*/) {
    trace_->record("PSListController", "reload");
}

void ScriptedScreen::listWillShowController(PSListController& /*list*/, PSController* controller,
                                            std::optional<bool> animate) {
    const Json shown = classNameOrNull(dynamic_cast<NSObject*>(controller));
    if (animate) {
        trace_->record("PSListController", "showController:animate:", shown, *animate);
    } else {
        trace_->record("PSListController", "showController:", shown);
    }
}

void ScriptedScreen::listWillHandleURL(PSListController& /*list*/, const std::string& url) {
    trace_->record("PSListController", "handleURL:", url);
}

void ScriptedScreen::tableWillReloadData(UITableView& /*table*/) {
    trace_->record("UITableView", "reloadData");
}

void ScriptedScreen::tableWillReloadRows(UITableView& /*table*/,
                                         const std::vector<NSIndexPath>& paths,
                                         UITableViewRowAnimation animation) {
    Json list = Json::array();
    for (const NSIndexPath& path : paths) {
        list.push_back(pathOf(path));
    }
    trace_->record("UITableView", "reloadRowsAtIndexPaths:withRowAnimation:", std::move(list),
                   static_cast<NSInteger>(animation));
}

void ScriptedScreen::tableWillDeselectRow(UITableView& /*table*/, const NSIndexPath& path,
                                          bool animated) {
    trace_->record("UITableView", "deselectRowAtIndexPath:animated:", pathOf(path), animated);
}

} // namespace quorl
