#pragma once

#include "platform/PreferencesList.h"

/// What the companion app offers to the panes that it shows. Main thread only.

/// The base of an app's pane: the class through which the host enters a plug-in.
class QPSNotificationAppController : public PSListController {
  public:
    /// What the pane is called, in the user's language.
    [[nodiscard]] virtual std::string localizedPaneTitle() = 0;

    /// The bundle that the pane comes from. Unless overridden: that of its class.
    [[nodiscard]] virtual std::shared_ptr<NSBundle> bundle();

    /// The identifier under which the app knows the pane. Unless overridden: that of its bundle.
    [[nodiscard]] virtual std::optional<std::string> applicationBundleIdentifier();

  protected:
    /// The row that switches the glance of the app with this identifier on the wearable; null where
    /// that app has none.
    [[nodiscard]] virtual std::shared_ptr<PSSpecifier>
    glanceSpecifierForIdentifier(const std::string& identifier);
};

/// The colour of what can be tapped and of what is chosen.
[[nodiscard]] UIColor QPSQuorlTintColor();
