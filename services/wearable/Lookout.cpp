#include "services/wearable/Lookout.h"

namespace quorl::wearable {

Usage Lookout::look() {
    const auto before = wearable();
    if (!before.isEmbedded() && isMountPoint(before.root)) {
        const std::scoped_lock lock(mutex_);
        wearable_.isMountPoint = true;
    }
    return readUsage(wearable());
}

Wearable Lookout::wearable() const {
    const std::scoped_lock lock(mutex_);
    return wearable_;
}

} // namespace quorl::wearable
