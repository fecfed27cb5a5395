#pragma once

#include "platform/PreferencesList.h"

namespace quorl {

/// A pane that a script names and that shows nothing: what another part of the app would hand to a
/// pane to be shown.
class StandInPane final : public UIViewController, public PSController {
  public:
    explicit StandInPane(std::string className) : className_(std::move(className)) {}

    [[nodiscard]] const std::string& className() const { return className_; }

    [[nodiscard]] PSController* parentController() const override { return parentController_; }

    void setParentController(PSController* controller) override { parentController_ = controller; }

    [[nodiscard]] PSRootController* rootController() const override { return rootController_; }

    void setRootController(PSRootController* controller) override { rootController_ = controller; }

    [[nodiscard]] std::shared_ptr<PSSpecifier> specifier() const override { return specifier_; }

    void setSpecifier(std::shared_ptr<PSSpecifier> specifier) override {
        specifier_ = std::move(specifier);
    }

  private:
    std::string className_;
    PSController* parentController_ = nullptr;
    PSRootController* rootController_ = nullptr;
    std::shared_ptr<PSSpecifier> specifier_;
};

} // namespace quorl
