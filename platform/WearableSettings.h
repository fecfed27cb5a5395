#pragma once

#include "platform/Dispatch.h"
#include "platform/Foundation.h"

/// A client of the wearable's settings service. Main thread; replies come on the queue given.
class LSSManager : public NSObject {
  public:
    /// What a usage question is answered with: figures, or null and an error.
    using UsageHandler =
        std::function<void(const NSDictionary<NSNumber>& usage, std::shared_ptr<NSError> error)>;

    /// A client whose replies run on `queue`. False where no host is there.
    [[nodiscard]] bool initWithQueue(dispatch_queue_t queue);

    /// Asks the wearable how its storage is used. Returns at once; calls `handler` exactly once,
    /// later, also when the wearable is gone or the client has been destroyed meanwhile, and
    /// destroys it after that.
    void getUsage(UsageHandler handler);

  private:
    std::shared_ptr<NSObject> _connection; ///< the runtime's own
    dispatch_queue_t _queue = nullptr;
};

/// Keys of the usage figures, byte counts both: what is free on the wearable, and what songs take.
extern const std::string_view kLSSUsageAvailableStorageKey;
extern const std::string_view kLSSUsageSongsKey;
