#include "services/engine/BusLoop.h"

#include <algorithm>
#include <cerrno>
#include <system_error>
#include <utility>

#include <poll.h>

namespace quorl::engine {

BusLoop::BusLoop(std::unique_ptr<sdbus::IConnection> bus)
    : bus_(std::move(bus)), mailbox_(std::make_shared<Mailbox>()), isBusThere_(bus_ != nullptr) {
    // What it is readable for is taken in each turn anyway.
    watch(mailbox_->descriptor(), POLLIN, [] {});
}

void BusLoop::watch(int descriptor, short events, Work ready) {
    watched_.insert_or_assign(descriptor, Watched{events, std::move(ready)});
}

void BusLoop::unwatch(int descriptor) { watched_.erase(descriptor); }

void BusLoop::callAt(Clock::time_point time, Work task) { timers_.emplace(time, std::move(task)); }

void BusLoop::stop() {
    post([this] { stopped_ = true; });
}

std::string BusLoop::run() {
    try {
        while (!stopped_) {
            // One message at a time, so that a flood of them keeps nothing else waiting.
            const bool mayHaveMore = serveBus();
            callPosted();
            callDue();
            if (!stopped_) {
                wait(mayHaveMore ? 0 : timeout());
            }
        }
        return {};
    } catch (const sdbus::Error& error) {
        isBusThere_ = false;
        return error.getMessage();
    }
}

bool BusLoop::serveBus() { return isBusThere_ && bus_->processPendingRequest(); }

int BusLoop::timeout() const {
    const auto ofBus = isBusThere_ ? bus_->getEventLoopPollData().getPollTimeout() : -1;
    if (timers_.empty()) {
        return ofBus;
    }
    using std::chrono::milliseconds;
    const auto left =
        std::chrono::ceil<milliseconds>(timers_.begin()->first - Clock::now()).count();
    const auto ofTimers = static_cast<int>(std::clamp<decltype(left)>(left, 0, 1'000'000));
    return ofBus < 0 ? ofTimers : std::min(ofBus, ofTimers);
}

void BusLoop::wait(int milliseconds) {
    std::vector<pollfd> polled{{-1, 0, 0}};
    if (isBusThere_) {
        const auto data = bus_->getEventLoopPollData();
        polled.front() = {data.fd, data.events, 0};
    }
    for (const auto& [descriptor, watched] : watched_) {
        polled.push_back({descriptor, watched.events, 0});
    }
    if (poll(polled.data(), polled.size(), milliseconds) < 0 && errno != EINTR) {
        throw std::system_error{errno, std::generic_category(), "poll"};
    }
    for (std::size_t at = 1; at < polled.size(); ++at) {
        if (polled[at].revents != 0) {
            callReady(polled[at].fd);
        }
    }
}

void BusLoop::callReady(int descriptor) {
    const auto found = watched_.find(descriptor);
    if (found != watched_.end()) {
        // A copy, for it may be unwatched meanwhile.
        const auto ready = found->second.ready;
        ready();
    }
}

void BusLoop::callPosted() {
    for (const auto& task : mailbox_->take()) {
        task();
    }
}

void BusLoop::callDue() {
    while (!timers_.empty() && timers_.begin()->first <= Clock::now()) {
        const auto task = std::move(timers_.begin()->second);
        timers_.erase(timers_.begin());
        task();
    }
}

} // namespace quorl::engine
