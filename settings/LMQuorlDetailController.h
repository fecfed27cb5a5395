#pragma once

#include "platform/PreferencesList.h"

/// The base of the panes that the rows of the Music pane open: what the list framework asks of a
/// pane that has nothing to do for it. What it is asked to show goes to its parent. Main thread
/// only.
class LMQuorlDetailController : public UITableViewController, public PSController {
  public:
    void showController(const std::shared_ptr<PSController>& controller) override;
    void showController_animate(const std::shared_ptr<PSController>& controller,
                                bool animate) override;
    void handleURL(const std::string& url) override;
    [[nodiscard]] std::shared_ptr<NSObject>
    readPreferenceValue(const std::shared_ptr<PSSpecifier>& specifier) override;
    void setPreferenceValue_specifier(const std::shared_ptr<NSObject>& value,
                                      const std::shared_ptr<PSSpecifier>& specifier) override;
    void suspend() override;
    void didLock() override;
    void willUnlock() override;
    void didUnlock() override;
    void didWake() override;
    void willBecomeActive() override;
    void willResignActive() override;
    void statusBarWillAnimateByHeight(double height) override;
    [[nodiscard]] bool canBeShownFromSuspendedState() override;

  protected:
    /// Reads everything shown anew.
    virtual void _reloadData() = 0;
};
