#include "runtime/lists/NavigationController.h"

#include "runtime/lists/ListView.h"
#include "runtime/lists/TableView.h"

namespace quorl {

void NavigationController::setRootPane(const std::shared_ptr<PSController>& pane) {
    pane->setRootController(this);
    stack_.push_back(std::dynamic_pointer_cast<UIViewController>(pane));
}

std::shared_ptr<UIViewController> NavigationController::top() const {
    return stack_.empty() ? nullptr : stack_.back();
}

void NavigationController::appear(bool animated) {
    if (const auto pane = top()) {
        pane->viewWillAppear(animated);
        pane->viewDidAppear(animated);
    }
}

void NavigationController::disappear(bool animated) {
    if (const auto pane = top()) {
        pane->viewWillDisappear(animated);
        pane->viewDidDisappear(animated);
    }
}

bool NavigationController::open(const std::shared_ptr<PSSpecifier>& specifier) {
    const auto& detail = specifier->detailControllerClass();
    const auto pane = detail ? std::dynamic_pointer_cast<PSController>(detail->create()) : nullptr;
    if (!pane) {
        return false;
    }
    pane->setParentController(dynamic_cast<PSController*>(top().get()));
    pane->setRootController(this);
    pane->setSpecifier(specifier);
    pushController_animated(pane, true);
    return true;
}

void NavigationController::pushController_animated(const std::shared_ptr<PSController>& controller,
                                                   bool animated) {
    const auto covered = top();
    const auto shown = std::dynamic_pointer_cast<UIViewController>(controller);
    if (auto* list = dynamic_cast<PSListController*>(shown.get())) {
        (void)list->specifiers(); // builds the rows before the list is shown
    }
    stack_.push_back(shown);
    if (covered) {
        covered->viewWillDisappear(animated);
    }
    shown->viewWillAppear(animated);
    if (covered) {
        covered->viewDidDisappear(animated);
    }
    shown->viewDidAppear(animated);
}

void NavigationController::pop(bool animated) {
    if (stack_.size() < 2) {
        return;
    }
    const auto left = std::move(stack_.back());
    stack_.pop_back();
    const auto shown = top();
    left->viewWillDisappear(animated);
    shown->viewWillAppear(animated);
    left->viewDidDisappear(animated);
    shown->viewDidAppear(animated);
}

void NavigationController::clear() {
    while (!stack_.empty()) {
        stack_.pop_back();
    }
}

bool NavigationController::openURL(const std::string& url) {
    auto* pane = dynamic_cast<PSController*>(top().get());
    if (pane) {
        pane->handleURL(url);
    }
    return pane != nullptr;
}

void draw(UIViewController& pane) {
    if (auto* list = dynamic_cast<PSListController*>(&pane)) {
        ListView::of(*list).draw();
    } else if (auto* table = dynamic_cast<UITableViewController*>(&pane)) {
        TableView::of(*table).draw();
    }
}

} // namespace quorl
