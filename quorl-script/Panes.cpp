#include "quorl-script/Panes.h"

#include <algorithm>

#include "quorl-script/Naming.h"
#include "quorl-script/input/Field.h"
#include "runtime/lists/ListView.h"
#include "runtime/lists/TableView.h"

namespace quorl {

namespace {

/// The stack of panes, which watches whatever is pushed.
class WatchedNavigation final : public NavigationController {
  public:
    explicit WatchedNavigation(std::shared_ptr<Trace> trace) : trace_(std::move(trace)) {}

    void pushController_animated(const std::shared_ptr<PSController>& controller,
                                 bool animated) override {
        auto& pane = dynamic_cast<NSObject&>(*controller);
        watchLife(pane, className(pane), trace_);
        NavigationController::pushController_animated(controller, animated);
    }

  private:
    std::shared_ptr<Trace> trace_;
};

/// Whether a switch of the list `pane` is on for whoever looks at it.
bool isDrawnOn(const UIViewController& pane, const std::shared_ptr<PSSpecifier>& specifier) {
    const auto& rows = ListView::of(dynamic_cast<const PSListController&>(pane)).rows();
    return std::ranges::any_of(rows, [&specifier](const ListView::Row& row) {
        return row.specifier == specifier && row.value == PSSwitchOnValue;
    });
}

} // namespace

Panes::Panes(ScreenDouble& screen, std::shared_ptr<Trace> trace)
    : screen_(screen),
      trace_(std::move(trace)),
      navigation_(std::make_shared<WatchedNavigation>(trace_)) {}

UIViewController& Panes::top() const {
    const auto pane = navigation_->top();
    if (!pane) {
        throw CommandError("there is no pane; \"create\" or \"open\" makes one");
    }
    return *pane;
}

UITableViewController& Panes::topTable() const {
    auto* table = dynamic_cast<UITableViewController*>(&top());
    if (!table) {
        throw CommandError("the top pane is no table; \"tap\" one of the root pane's rows first");
    }
    return *table;
}

PSListController& Panes::root() const {
    (void)top();
    return dynamic_cast<PSListController&>(*stack().front());
}

void Panes::createRoot(const Class& rootClass) {
    const auto pane = std::dynamic_pointer_cast<PSListController>(rootClass.create());
    if (!pane) {
        throw CommandError("the class \"" + rootClass.name() + "\" gave no pane");
    }
    watchLife(*pane, className(*pane), trace_);
    releaseAll();
    navigation_->setRootPane(pane);
}

void Panes::askForSpecifiers() { (void)root().specifiers(); }

void Panes::appear(bool animated) {
    (void)top();
    navigation_->appear(animated);
    isOnScreen_ = true;
}

void Panes::disappear(bool animated) {
    (void)top();
    navigation_->disappear(animated);
    isOnScreen_ = false;
}

void Panes::tapSpecifier(const std::string& title) {
    const auto specifier = rowOnScreen(title);
    if (specifier->cellType() == PSCellType::Switch) {
        specifier->setValue(NSNumber::numberWithBool(!isDrawnOn(top(), specifier)));
    } else if (specifier->cellType() == PSCellType::Button) {
        specifier->setValue(nullptr);
    } else if (specifier->detailControllerClass() && !navigation_->open(specifier)) {
        throw CommandError("\"specifier\": the row's pane could not be made");
    }
}

std::shared_ptr<PSSpecifier> Panes::rowOnScreen(const std::string& title) const {
    auto* list = stack().empty() ? nullptr : dynamic_cast<PSListController*>(stack().back().get());
    if (isOnScreen_ && list) {
        const auto rows = list->specifiers();
        for (const auto& specifier : elements(rows)) {
            if (specifier->cellType() != PSCellType::Group && specifier->name() == title) {
                return specifier;
            }
        }
    }
    throw CommandError("\"specifier\": no row of this title is on the screen");
}

void Panes::tapRow(const NSIndexPath& path) {
    UITableViewController& pane = topTable();
    TableView& table = TableView::of(pane);
    if (!isOnScreen_ || !table.cellForRowAtIndexPath(path)) {
        throw CommandError("\"path\": this row is not on the screen");
    }
    pane.tableView_didSelectRowAtIndexPath(table, path);
}

void Panes::back() {
    if (stack().size() < 2) {
        throw CommandError("there is no pane to go back to");
    }
    navigation_->pop(true);
}

void Panes::scrollTo(NSInteger row) { TableView::of(topTable()).scrollToRow(row); }

void Panes::releaseAll() {
    navigation_->clear();
    isOnScreen_ = false;
}

void Panes::draw() {
    const Trace::Pause pause(*trace_);
    for (const auto& pane : stack()) {
        const auto* controller = dynamic_cast<const UITableViewController*>(pane.get());
        if (!controller) {
            quorl::draw(*pane);
            continue;
        }
        TableView& table = TableView::of(*controller);
        table.setRowsOnScreen(screen_.looks.rows);
        table.draw();
        for (const auto& [path, cell] : table.visibleRows()) {
            if (cell) {
                watchLife(*cell, className(*cell), trace_);
            }
        }
    }
}

} // namespace quorl
