#include "runtime/host/Host.h"
#include "runtime/lists/TableView.h"

void UIViewController::setTitle(std::optional<std::string> title) { _title = std::move(title); }

void UIViewController::viewWillAppear(bool /*animated*/) {}

void UIViewController::viewDidAppear(bool /*animated*/) {}

void UIViewController::viewWillDisappear(bool /*animated*/) {}

void UIViewController::viewDidDisappear(bool /*animated*/) {}

UITableViewController::UITableViewController() = default;

UITableViewController::~UITableViewController() = default;

bool UITableViewController::init() { return initWithStyle(UITableViewStyle::Plain); }

bool UITableViewController::initWithStyle(UITableViewStyle style) {
    _style = style;
    _tableView = std::make_shared<quorl::TableView>(*this);
    return UIViewController::init() && quorl::Host::current() != nullptr;
}

void UITableViewController::viewWillAppear(bool animated) {
    UIViewController::viewWillAppear(animated);
    quorl::TableView::of(*this).setOnScreen(true);
}

void UITableViewController::viewDidDisappear(bool animated) {
    UIViewController::viewDidDisappear(animated);
    quorl::TableView::of(*this).setOnScreen(false);
}
