#pragma once

#include "quorl-syncd/engine/ports/Turns.h"
#include "services/engine/BusLoop.h"

namespace quorl::syncd {

/// The turns of a loop, and the clocks of this machine.
class LoopTurns final : public Turns {
  public:
    explicit LoopTurns(engine::BusLoop& loop) : loop_(loop) {}

    [[nodiscard]] TimePoint now() const override { return engine::BusLoop::Clock::now(); }

    void callAt(TimePoint time, Work work) override { loop_.callAt(time, std::move(work)); }

    [[nodiscard]] std::uint64_t calendarTime() const override {
        using std::chrono::microseconds;
        const auto now = std::chrono::system_clock::now().time_since_epoch();
        return static_cast<std::uint64_t>(std::chrono::duration_cast<microseconds>(now).count());
    }

  private:
    engine::BusLoop& loop_;
};

} // namespace quorl::syncd
