#pragma once

#include "quorl-syncd/transfer/pace/Clock.h"

namespace quorl::syncd {

/// The clock of this machine.
class SteadyClock final : public Clock {
  public:
    [[nodiscard]] TimePoint now() const override { return std::chrono::steady_clock::now(); }
};

} // namespace quorl::syncd
