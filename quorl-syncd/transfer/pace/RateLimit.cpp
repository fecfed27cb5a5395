#include "quorl-syncd/transfer/pace/RateLimit.h"

#include <algorithm>
#include <chrono>

namespace quorl::syncd {

void RateLimit::set(std::uint64_t bytesPerSecond) {
    {
        const std::scoped_lock lock(mutex_);
        bytesPerSecond_ = bytesPerSecond;
    }
    changed_.notify_all();
}

std::uint64_t RateLimit::get() const {
    const std::scoped_lock lock(mutex_);
    return bytesPerSecond_;
}

std::size_t RateLimit::chunk() const {
    constexpr std::uint64_t smallest = 4096;
    constexpr std::uint64_t largest = 1 << 20;
    constexpr std::uint64_t chunksPerSecond = 10;
    const auto rate = get();
    return static_cast<std::size_t>(
        rate == 0 ? largest : std::clamp(rate / chunksPerSecond, smallest, largest));
}

void RateLimit::pace(std::uint64_t bytes, const std::stop_token& stop) {
    const auto begun = std::chrono::steady_clock::now();
    std::unique_lock lock(mutex_);
    while (bytesPerSecond_ != 0 && !stop.stop_requested()) {
        const auto rate = bytesPerSecond_;
        const std::chrono::duration<double> duration(static_cast<double>(bytes) /
                                                     static_cast<double>(rate));
        const auto due = begun + std::chrono::ceil<std::chrono::steady_clock::duration>(duration);
        if (!changed_.wait_until(lock, stop, due, [&] { return bytesPerSecond_ != rate; })) {
            return;
        }
    }
}

} // namespace quorl::syncd
