// A plug-in with nothing but a title, built against the interface of this tree.

#include "platform/HostApp.h"

class TestPane : public QPSNotificationAppController {
  public:
    [[nodiscard]] bool init() override;

    [[nodiscard]] std::string localizedPaneTitle() override {
        return bundle()->localizedStringForKey_value_table("TITLE", "Default title", std::nullopt);
    }
};

bool TestPane::init() {
    if (!QPSNotificationAppController::init()) {
        return false;
    }
    setTitle(localizedPaneTitle());
    return true;
}

QUORL_EXPORT_CLASS(TestPane)
