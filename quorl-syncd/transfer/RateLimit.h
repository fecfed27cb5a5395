#pragma once

#include <condition_variable>
#include <cstdint>
#include <mutex>
#include <stop_token>

namespace quorl::syncd {

/// How fast songs are copied at most, for a wearable that would otherwise be too fast to watch. Any
/// thread.
class RateLimit {
  public:
    /// @param bytesPerSecond 0 for no limit. Counts at once, also for a copy that is waiting.
    void set(std::uint64_t bytesPerSecond);

    [[nodiscard]] std::uint64_t get() const;

    /// How much to copy at once, so that progress moves several times a second.
    [[nodiscard]] std::size_t chunk() const;

    /// Waits until `bytes` more may be copied, or until `stop` is requested.
    void pace(std::uint64_t bytes, const std::stop_token& stop);

  private:
    mutable std::mutex mutex_;
    std::condition_variable_any changed_;
    std::uint64_t bytesPerSecond_ = 0;
};

} // namespace quorl::syncd
