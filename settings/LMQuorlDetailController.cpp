#include "settings/LMQuorlDetailController.h"

using Self = LMQuorlDetailController;

void Self::showController(const std::shared_ptr<PSController>& controller) {
    if (auto* parent = parentController()) {
        parent->showController(controller);
    }
}

void Self::showController_animate(const std::shared_ptr<PSController>& controller, bool animate) {
    if (auto* parent = parentController()) {
        parent->showController_animate(controller, animate);
    }
}

void Self::handleURL(const std::string& url) {
    if (auto* parent = parentController()) {
        parent->handleURL(url);
    }
}

std::shared_ptr<NSObject>
Self::readPreferenceValue(const std::shared_ptr<PSSpecifier>& /*specifier*/) {
    return nullptr;
}

void Self::setPreferenceValue_specifier(const std::shared_ptr<NSObject>& /*value*/,
                                        const std::shared_ptr<PSSpecifier>& /*specifier*/) {}

void Self::suspend() {}

void Self::didLock() {}

void Self::willUnlock() {}

void Self::didUnlock() {}

void Self::didWake() {}

void Self::willBecomeActive() { _reloadData(); }

void Self::willResignActive() {}

void Self::statusBarWillAnimateByHeight(double /*height*/) {}

bool Self::canBeShownFromSuspendedState() { return true; }
