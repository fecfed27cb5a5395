#include "platform/WearableSettings.h"

#include "runtime/host/Host.h"
#include "runtime/services/WearableConnection.h"

const std::string_view kLSSUsageAvailableStorageKey = "kLSSUsageAvailableStorageKey";
const std::string_view kLSSUsageSongsKey = "kLSSUsageSongsKey";

bool LSSManager::initWithQueue(dispatch_queue_t queue) {
    if (!NSObject::init() || !quorl::Host::current()) {
        return false;
    }
    _connection = quorl::Host::current()->connectToWearable(queue);
    _queue = queue;
    return true;
}

void LSSManager::getUsage(UsageHandler handler) {
    // The handler goes to the queue with the reply, so that what it captures is let go of there.
    auto shared = std::make_shared<UsageHandler>(std::move(handler));
    static_cast<quorl::WearableConnection&>(*_connection)
        .requestUsage(
            [queue = _queue, shared = std::move(shared)](const NSDictionary<NSNumber>& usage,
                                                         std::shared_ptr<NSError> error) mutable {
                dispatch_async(queue, [usage, error = std::move(error),
                                       shared = std::move(shared)] { (*shared)(usage, error); });
            });
}
