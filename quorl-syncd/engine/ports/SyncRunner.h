#pragma once

#include <cstdint>
#include <functional>
#include <memory>

#include "quorl-syncd/transfer/CopyProgress.h"
#include "quorl-syncd/transfer/Order.h"
#include "quorl-syncd/transfer/Outcome.h"

namespace quorl::syncd {

/// A sync that is under way.
class RunningSync {
  public:
    /// Stops the sync where it has not ended, and waits for its end for some seconds from the first
    /// call of `stop` on; one whose device hangs is left to itself. No call comes any more.
    virtual ~RunningSync() = default;

    /// Has it end soon, in order. Returns at once.
    virtual void stop() = 0;
};

/// Where syncs run: on a thread of their own, or within a turn. One at a time.
class SyncRunner {
  public:
    using Copied = std::function<void(const CopyProgress&)>;
    using Ended = std::function<void(const Outcome&)>;

    virtual ~SyncRunner() = default;

    /// Begins a sync. `copied` is called in a later turn when it is known what is there already,
    /// then now and then, at the latest with each further song; `ended` is called once, as the
    /// last, and may destroy the running sync. Neither comes before this has returned. A sync that
    /// cannot be begun ends so, too.
    [[nodiscard]] virtual std::unique_ptr<RunningSync> begin(const Order& order, Copied copied,
                                                             Ended ended) = 0;

    /// In bytes a second; 0 for no limit. Counts at once, also for the sync that is under way.
    virtual void setRateLimit(std::uint64_t bytesPerSecond) = 0;
};

} // namespace quorl::syncd
