// A plug-in that passes the beginning of a session on, at once and on the thread that told it.

#include "platform/HostApp.h"
#include "platform/SyncSessions.h"

class ObservingPane : public QPSNotificationAppController, public DVSessionObserver {
  public:
    [[nodiscard]] bool init() override {
        const auto sessions = DVSession::sessionsWithSessionTypeIdentifier(DVSessionTypeDeviceSync);
        for (const auto& session : elements(sessions)) {
            session->addObserver(strong(this));
        }
        return QPSNotificationAppController::init();
    }

    [[nodiscard]] std::string localizedPaneTitle() override { return "Observing"; }

    void sessionWillBegin(DVSession& /*session*/) override {
        NSNotificationCenter::defaultCenter().postNotificationName_object("SessionWillBegin",
                                                                          nullptr);
    }
};

QUORL_EXPORT_CLASS(ObservingPane)
