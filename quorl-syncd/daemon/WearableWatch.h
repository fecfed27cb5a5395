#pragma once

#include <filesystem>
#include <functional>

#include "quorl-syncd/engine/ports/WearablePort.h"
#include "services/base/Errand.h"

namespace quorl::syncd {

/// Notices what happens to the directory of a wearable, on a thread of its own, for the way to it
/// may lead over a device that hangs.
class WearableWatch {
  public:
    /// Called on that thread, also when this is gone already.
    using Tell = std::function<void(WearableNews)>;

    /// @param root is absolute and need not be there.
    /// @param tell owns all that it uses.
    /// Throws `std::system_error` where no thread can be started.
    WearableWatch(const std::filesystem::path& root, Tell tell);

  private:
    base::Errand errand_;
};

} // namespace quorl::syncd
