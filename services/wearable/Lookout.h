#pragma once

#include <mutex>

#include "services/wearable/Usage.h"
#include "services/wearable/Wearable.h"

namespace quorl::wearable {

/// Looks at one wearable again and again. Once something was mounted at its directory, the mere
/// directory is not the wearable any more. Any thread.
class Lookout {
  public:
    explicit Lookout(Wearable wearable) : wearable_(std::move(wearable)) {}

    /// As `readUsage`.
    [[nodiscard]] Usage look();

    /// As it was last seen.
    [[nodiscard]] Wearable wearable() const;

  private:
    mutable std::mutex mutex_;
    Wearable wearable_;
};

} // namespace quorl::wearable
