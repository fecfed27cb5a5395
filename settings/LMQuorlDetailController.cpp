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

void Self::willBecomeActive() { _reloadData(); }
