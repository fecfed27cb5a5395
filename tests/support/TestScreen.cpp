#include "tests/support/TestScreen.h"

#include <sstream>

namespace quorl::tests {

namespace {

std::string textOf(const NSIndexPath& path) {
    return std::to_string(path.section) + "." + std::to_string(path.row);
}

} // namespace

CGSize TestScreen::sizeOfText(const UILabel& label) const {
    const auto length = label.text() ? label.text()->size() : 0;
    return length == 0 ? CGSize{} : CGSize{static_cast<CGFloat>(10 * length), 20};
}

void TestScreen::layOutLabels(UITableViewCell& cell) {
    if (standardFrames_) {
        cell.textLabel().setFrame(standardFrames_->title);
        cell.detailTextLabel().setFrame(standardFrames_->detail);
    } else {
        Screen::layOutLabels(cell);
    }
}

void TestScreen::labelDidSetFrame(UILabel& label) {
    const CGRect frame = label.frame();
    std::ostringstream line;
    line << "frame " << label.text().value_or("null") << " " << frame.x << " " << frame.y << " "
         << frame.width << " " << frame.height;
    journal_.note(line.str());
}

void TestScreen::specifierWillSetProperty(PSSpecifier& /*specifier*/,
                                          const std::optional<std::string>& value,
                                          std::string_view key) {
    if (key == PSFooterTextGroupKey) {
        journal_.note("footer " + value.value_or("null"));
    }
}

void TestScreen::listWillReloadSpecifier(PSListController& /*list*/, const PSSpecifier* specifier) {
    journal_.note("row " + (specifier ? specifier->name().value_or("untitled") : "null"));
}

void TestScreen::listWillReload(PSListController& /*list*/) { journal_.note("list"); }

void TestScreen::listWillShowController(PSListController& /*list*/, PSController* /*controller*/,
                                        std::optional<bool> animate) {
    journal_.note(!animate ? "show" : *animate ? "show animated" : "show at once");
}

void TestScreen::listWillHandleURL(PSListController& /*list*/, const std::string& url) {
    journal_.note("url " + url);
}

void TestScreen::tableWillReloadData(UITableView& /*table*/) { journal_.note("table"); }

void TestScreen::tableWillReloadRows(UITableView& /*table*/, const std::vector<NSIndexPath>& paths,
                                     UITableViewRowAnimation animation) {
    std::string line = "rows";
    for (const NSIndexPath& path : paths) {
        line += " " + textOf(path);
    }
    journal_.note(line + (animation == UITableViewRowAnimation::Fade ? " fading" : ""));
}

void TestScreen::tableWillDeselectRow(UITableView& /*table*/, const NSIndexPath& path,
                                      bool animated) {
    journal_.note("deselect " + textOf(path) + (animated ? " fading" : ""));
}

} // namespace quorl::tests
