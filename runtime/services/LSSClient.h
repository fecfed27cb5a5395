#pragma once

#include "platform/WearableSettings.h"

/// A host's connection to the wearable's settings service.
class LSSClient {
  public:
    virtual ~LSSClient() = default;

    /// Asks the wearable for its usage figures without blocking. `reply` is called exactly once, on
    /// any thread, also when the connection has been destroyed meanwhile.
    virtual void requestUsage(LSSManager::UsageHandler reply) = 0;
};
