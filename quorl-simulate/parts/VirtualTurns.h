#pragma once

#include <functional>
#include <map>
#include <utility>

#include "quorl-syncd/engine/ports/Turns.h"
#include "quorl-syncd/transfer/pace/Throttle.h"

namespace quorl::simulation {

/// Time that passes only where it is let, and the work that waits for it. Copying at a rate takes
/// time, too.
class VirtualTurns final : public syncd::Turns, public syncd::Throttle {
  public:
    using Duration = TimePoint::duration;
    /// Says that work for a time is not to be called at all.
    using Forgets = std::function<bool(Duration untilThen)>;

    explicit VirtualTurns(Forgets forgets) : forgets_(std::move(forgets)) {}

    [[nodiscard]] TimePoint now() const override { return now_; }

    void callAt(TimePoint time, Work work) override {
        if (!forgets_(time - now_)) {
            work_.emplace(time, std::move(work));
        }
    }

    void call(Work work) { work_.emplace(now_, std::move(work)); }

    [[nodiscard]] std::uint64_t calendarTime() const override { return calendarTime_; }

    void setCalendarTime(std::uint64_t microseconds) { calendarTime_ = microseconds; }

    void pass(Duration time) { now_ += time; }

    [[nodiscard]] bool isIdle() const { return work_.empty(); }

    [[nodiscard]] bool isDue() const { return !work_.empty() && work_.begin()->first <= now_; }

    [[nodiscard]] bool isDueWithin(Duration time) const {
        return !work_.empty() && work_.begin()->first <= now_ + time;
    }

    /// Lets time pass until the next work is due, and does it.
    void takeTurn() {
        const auto next = work_.extract(work_.begin());
        now_ = std::max(now_, next.key());
        next.mapped()();
    }

    /// The engine is gone.
    void forget() { work_.clear(); }

    [[nodiscard]] std::size_t chunk() const override { return 256; }

    void pace(std::uint64_t bytes, const std::stop_token& /*stop*/) override {
        if (rate_ != 0) {
            pass(std::chrono::microseconds(bytes * 1'000'000 / rate_));
        }
    }

    void setRate(std::uint64_t bytesPerSecond) { rate_ = bytesPerSecond; }

  private:
    const Forgets forgets_;
    TimePoint now_ = TimePoint(std::chrono::hours(1));
    std::uint64_t calendarTime_ = 1'700'000'000'000'000;
    std::uint64_t rate_ = 0;
    std::multimap<TimePoint, Work> work_;
};

} // namespace quorl::simulation
