#include "platform/PreferencesList.h"

#include <algorithm>

#include "runtime/host/Host.h"
#include "runtime/host/Screen.h"
#include "runtime/lists/ListView.h"

using quorl::ListView;

const std::string_view PSSwitchOnValue = "on";
const std::string_view PSSwitchOffValue = "off";
const std::string_view PSFooterTextGroupKey = "PSFooterTextGroupKey";

namespace {

quorl::Screen& screen() { return quorl::Host::required().screen(); }

} // namespace

std::shared_ptr<PSSpecifier> PSSpecifier::preferenceSpecifierNamed_target_set_get_detail_cell_edit(
    std::optional<std::string> name, const std::shared_ptr<NSObject>& target,
    std::optional<PSSetter> set, std::optional<PSGetter> get, std::optional<Class> detail,
    PSCellType cell, std::optional<Class> edit) {
    auto specifier = create<PSSpecifier>();
    specifier->_name = std::move(name);
    specifier->_target = target;
    specifier->_set = set;
    specifier->_get = get;
    specifier->_detail = detail;
    specifier->_cell = cell;
    specifier->_edit = edit;
    return specifier;
}

std::optional<std::string> PSSpecifier::value() {
    const auto target = _target.lock();
    return target && _get ? (*_get)(*target, strong(this)) : std::nullopt;
}

void PSSpecifier::setValue(const std::shared_ptr<NSObject>& value) {
    if (const auto target = _target.lock(); target && _set) {
        (*_set)(*target, value, strong(this));
    }
}

void PSSpecifier::setProperty_forKey(std::optional<std::string> value, std::string_view key) {
    if (auto* host = quorl::Host::current()) {
        host->screen().specifierWillSetProperty(*this, value, key);
    }
    if (value) {
        _properties.insert_or_assign(std::string(key), std::move(*value));
    } else if (const auto found = _properties.find(key); found != _properties.end()) {
        _properties.erase(found);
    }
}

std::optional<std::string> PSSpecifier::propertyForKey(std::string_view key) const {
    const auto found = _properties.find(key);
    return found == _properties.end() ? std::nullopt : std::optional(found->second);
}

bool PSListController::init() {
    _listView = std::make_shared<ListView>(*this);
    return UIViewController::init() && quorl::Host::current() != nullptr;
}

PSListAppearance PSListController::appearance() { return {screen().listTextColor()}; }

NSArray<PSSpecifier> PSListController::specifiers() { return _specifiers; }

void PSListController::reloadSpecifier(const std::shared_ptr<PSSpecifier>& specifier) {
    screen().listWillReloadSpecifier(*this, specifier.get());
    const auto rows = elements<PSSpecifier>(_specifiers);
    if (specifier && std::find(rows.begin(), rows.end(), specifier) != rows.end()) {
        ListView::of(*this).update(specifier);
    }
}

void PSListController::reload() {
    screen().listWillReload(*this);
    ListView::of(*this).markForDrawing();
}

void PSListController::viewDidAppear(bool animated) {
    UIViewController::viewDidAppear(animated);
    ListView::of(*this).setShown();
}

PSController* PSListController::parentController() const { return _parentController; }

void PSListController::setParentController(PSController* controller) {
    _parentController = controller;
}

PSRootController* PSListController::rootController() const { return _rootController; }

void PSListController::setRootController(PSRootController* controller) {
    _rootController = controller;
}

std::shared_ptr<PSSpecifier> PSListController::specifier() const { return _specifier; }

void PSListController::setSpecifier(std::shared_ptr<PSSpecifier> specifier) {
    _specifier = std::move(specifier);
}

void PSListController::showController(const std::shared_ptr<PSController>& controller) {
    show(controller, std::nullopt);
}

void PSListController::showController_animate(const std::shared_ptr<PSController>& controller,
                                              bool animate) {
    show(controller, animate);
}

void PSListController::show(const std::shared_ptr<PSController>& controller,
                            std::optional<bool> animate) {
    screen().listWillShowController(*this, controller.get(), animate);
    if (controller && _rootController) {
        controller->setParentController(this);
        controller->setRootController(_rootController);
        _rootController->pushController_animated(controller, animate.value_or(true));
    }
}

void PSListController::handleURL(const std::string& url) { screen().listWillHandleURL(*this, url); }
