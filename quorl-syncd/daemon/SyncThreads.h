#pragma once

#include <functional>
#include <memory>

#include "quorl-syncd/engine/ports/SyncRunner.h"
#include "services/engine/BusLoop.h"

namespace quorl::syncd {

/// Syncs to devices of this machine, each on a thread of its own, which tell of themselves through
/// a loop.
class SyncThreads final : public SyncRunner {
  public:
    /// Keeps the machine awake for as long as the result lives. Called on the thread of a sync.
    using KeepAwake = std::function<std::shared_ptr<void>()>;

    SyncThreads(engine::BusLoop& loop, KeepAwake keepAwake);
    ~SyncThreads() override;

    [[nodiscard]] std::unique_ptr<RunningSync> begin(const Order& order, Copied copied,
                                                     Ended ended) override;

    void setRateLimit(std::uint64_t bytesPerSecond) override;

  private:
    struct Means;

    engine::BusLoop& loop_;
    const std::shared_ptr<Means> means_;
};

} // namespace quorl::syncd
