#include "runtime/lists/NavigationController.h"

#include <algorithm>
#include <utility>

#include "runtime/lists/ListView.h"
#include "runtime/lists/TableView.h"

namespace quorl {

namespace {

void appear(UIViewController& pane, bool animated) {
    pane.viewWillAppear(animated);
    pane.viewDidAppear(animated);
}

void disappear(UIViewController& pane, bool animated) {
    pane.viewWillDisappear(animated);
    pane.viewDidDisappear(animated);
}

} // namespace

void NavigationController::setRootPane(const std::shared_ptr<PSController>& pane) {
    pane->setRootController(this);
    stack_.push_back(std::dynamic_pointer_cast<UIViewController>(pane));
}

std::shared_ptr<UIViewController> NavigationController::top() const {
    return stack_.empty() ? nullptr : stack_.back();
}

bool NavigationController::isAlwaysSeen(const UIViewController& pane) const {
    return rootPlace_ == RootPlace::Beside && &pane == stack_.front().get();
}

void NavigationController::setRootPlace(RootPlace place) {
    const bool isChange = std::exchange(rootPlace_, place) != place;
    if (!isChange || !isOnScreen_ || stack_.size() < 2) {
        return;
    }
    if (place == RootPlace::Beside) {
        quorl::appear(*stack_.front(), false);
    } else {
        quorl::disappear(*stack_.front(), false);
    }
}

std::vector<std::shared_ptr<UIViewController>> NavigationController::onScreen() const {
    auto seen = stack_;
    std::erase_if(seen, [this](const auto& pane) { return pane != top() && !isAlwaysSeen(*pane); });
    return seen;
}

void NavigationController::appear(bool animated) {
    isOnScreen_ = true;
    for (const auto& pane : onScreen()) {
        quorl::appear(*pane, animated);
    }
}

void NavigationController::disappear(bool animated) {
    isOnScreen_ = false;
    for (const auto& pane : onScreen()) {
        quorl::disappear(*pane, animated);
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
    const auto covered = top() && !isAlwaysSeen(*top()) ? top() : nullptr;
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
    const auto uncovered = isAlwaysSeen(*top()) ? nullptr : top();
    left->viewWillDisappear(animated);
    if (uncovered) {
        uncovered->viewWillAppear(animated);
    }
    left->viewDidDisappear(animated);
    if (uncovered) {
        uncovered->viewDidAppear(animated);
    }
}

void NavigationController::returnTo(const UIViewController& pane) {
    while (above(pane)) {
        pop(true);
    }
}

std::shared_ptr<UIViewController> NavigationController::above(const UIViewController& pane) const {
    const auto place =
        std::ranges::find_if(stack_, [&](const auto& each) { return each.get() == &pane; });
    return stack_.end() - place > 1 ? *(place + 1) : nullptr;
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
