#include "quorl/process/MainQueueNotifier.h"

#include "runtime/objects/MainQueue.h"

namespace quorl {

MainQueueNotifier::MainQueueNotifier() : notifier_(mainQueueDescriptor(), QSocketNotifier::Read) {
    connect(&notifier_, &QSocketNotifier::activated, this, [this] {
        drainMainQueue();
        Q_EMIT drained();
    });
}

} // namespace quorl
