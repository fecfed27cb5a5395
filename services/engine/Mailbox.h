#pragma once

#include <functional>
#include <mutex>
#include <vector>

#include "services/base/FileDescriptor.h"

namespace quorl::engine {

/// What other threads hand over to a loop. Outlives the loop where such a thread holds it; what is
/// handed over then comes to nothing. Any thread.
class Mailbox {
  public:
    using Work = std::function<void()>;

    /// Throws `std::system_error`.
    Mailbox();

    /// Never waits.
    void post(Work work);

    /// Readable while there is something to take.
    [[nodiscard]] int descriptor() const { return wake_.get(); }

    /// All that was handed over since the last time, in its order.
    [[nodiscard]] std::vector<Work> take();

  private:
    const base::FileDescriptor wake_;
    std::mutex mutex_;
    std::vector<Work> posted_;
};

} // namespace quorl::engine
