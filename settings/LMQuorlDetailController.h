#pragma once

#include "platform/PreferencesList.h"

/// The base of the panes that the rows of the Music pane open. What it is asked to show or to open
/// goes to its parent. Main thread only.
class LMQuorlDetailController : public UITableViewController, public PSController {
  public:
    void showController(const std::shared_ptr<PSController>& controller) override;
    void showController_animate(const std::shared_ptr<PSController>& controller,
                                bool animate) override;
    void handleURL(const std::string& url) override;
    void willBecomeActive() override;

  protected:
    /// Reads everything shown anew.
    virtual void _reloadData() = 0;
};
