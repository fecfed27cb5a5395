#include "services/media/Workers.h"

#include <algorithm>
#include <atomic>
#include <system_error>
#include <thread>
#include <vector>

namespace quorl::media {

std::size_t workerCount() {
    static const std::size_t count = std::max(1U, std::thread::hardware_concurrency());
    return count;
}

void shareOut(std::size_t count, const std::function<void(std::size_t, std::size_t)>& work) {
    std::atomic<std::size_t> next = 0;
    // One index after the other, so that nobody waits for whoever got the longer half.
    const auto takeTurns = [&](std::size_t worker) {
        for (std::size_t index = next++; index < count; index = next++) {
            work(index, worker);
        }
    };
    constexpr std::size_t fewest = 32; // fewer are done before another thread has begun
    std::vector<std::jthread> others;
    try {
        for (std::size_t worker = 1; count >= fewest && worker < workerCount(); ++worker) {
            others.emplace_back(takeTurns, worker);
        }
    } catch (const std::system_error&) {
        // The system has no more threads: those that are there do all of it.
    }
    takeTurns(0);
}

} // namespace quorl::media
