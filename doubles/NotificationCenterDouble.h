#pragma once

#include "doubles/CallRecorder.h"
#include "runtime/objects/NotificationCenter.h"

namespace quorl {

/// The runtime's notification centre, with a recorder. Any thread.
class NotificationCenterDouble final : public NotificationCenter {
  public:
    explicit NotificationCenterDouble(std::shared_ptr<CallRecorder> recorder)
        : recorder_(std::move(recorder)) {}

    void addObserver_selector_name_object(NSObject* observer, NSNotificationSelector selector,
                                          NSNotificationName name, const NSObject* object) override;
    void removeObserver(const NSObject* observer) override;
    void postNotificationName_object(NSNotificationName name, NSObject* object) override;

  private:
    std::shared_ptr<CallRecorder> recorder_;
};

} // namespace quorl
