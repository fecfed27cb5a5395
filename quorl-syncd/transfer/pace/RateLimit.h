#pragma once

#include <condition_variable>
#include <cstdint>
#include <mutex>
#include <stop_token>

#include "quorl-syncd/transfer/pace/Throttle.h"

namespace quorl::syncd {

/// A rate, for a wearable that would otherwise be too fast to watch. Any thread.
class RateLimit final : public Throttle {
  public:
    /// @param bytesPerSecond 0 for no limit. Counts at once, also for a copy that is waiting.
    void set(std::uint64_t bytesPerSecond);

    [[nodiscard]] std::uint64_t get() const;

    [[nodiscard]] std::size_t chunk() const override;
    void pace(std::uint64_t bytes, const std::stop_token& stop) override;

  private:
    mutable std::mutex mutex_;
    std::condition_variable_any changed_;
    std::uint64_t bytesPerSecond_ = 0;
};

} // namespace quorl::syncd
