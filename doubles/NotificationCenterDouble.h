#pragma once

#include "quorl-script/Trace.h"
#include "runtime/objects/NotificationCenter.h"

namespace quorl {

/// The runtime's notification centre with a trace. Any thread.
class TracingNotificationCenter final : public NotificationCenter {
  public:
    explicit TracingNotificationCenter(std::shared_ptr<Trace> trace) : trace_(std::move(trace)) {}

    void addObserver_selector_name_object(NSObject* observer, NSNotificationSelector selector,
                                          NSNotificationName name, const NSObject* object) override;
    void removeObserver(const NSObject* observer) override;
    void postNotificationName_object(NSNotificationName name, NSObject* object) override;

  private:
    std::shared_ptr<Trace> trace_;
};

} // namespace quorl
