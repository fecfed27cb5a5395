#pragma once

#include "platform/WearableSettings.h"

namespace quorl {

/// A host's connection to the wearable's settings service.
class WearableConnection : public NSObject {
  public:
    /// Asks the wearable for its usage figures without blocking. `reply` is called exactly once, on
    /// any thread, also when the connection has been destroyed meanwhile.
    virtual void requestUsage(LSSManager::UsageHandler reply) = 0;
};

} // namespace quorl
