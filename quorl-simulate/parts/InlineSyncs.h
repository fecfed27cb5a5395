#pragma once

#include <stop_token>

#include "quorl-simulate/parts/VirtualTurns.h"
#include "quorl-syncd/engine/ports/SyncRunner.h"
#include "quorl-syncd/transfer/SyncPorts.h"

namespace quorl::simulation {

/// Runs a sync within a turn. What happens meanwhile, turns of the engine too, happens within the
/// operations of the device.
class InlineSyncs final : public syncd::SyncRunner {
  public:
    /// @param ended called when a sync has ended, before the engine hears of it.
    /// @param isTooEarly has syncs be called sent before they are.
    InlineSyncs(VirtualTurns& turns, syncd::SyncPorts ports, std::function<void()> ended,
                bool isTooEarly)
        : turns_(turns),
          ports_(std::move(ports)),
          ended_(std::move(ended)),
          isTooEarly_(isTooEarly) {}

    [[nodiscard]] std::unique_ptr<syncd::RunningSync> begin(const syncd::Order& order,
                                                            Copied copied, Ended ended) override;

    void setRateLimit(std::uint64_t bytesPerSecond) override { turns_.setRate(bytesPerSecond); }

    [[nodiscard]] bool isRunning() const { return isRunning_; }

    void stop() { stop_.request_stop(); }

    /// The engine is gone.
    void forget() { isRunning_ = false; }

  private:
    void run(const syncd::Order& order, const Copied& copied, const Ended& ended);

    VirtualTurns& turns_;
    const syncd::SyncPorts ports_;
    const std::function<void()> ended_;
    const bool isTooEarly_;
    std::stop_source stop_;
    bool isRunning_ = false;
};

} // namespace quorl::simulation
