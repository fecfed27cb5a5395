#pragma once

#include <cstddef>
#include <cstdint>

#include "quorl-syncd/transfer/pace/Clock.h"

namespace quorl::syncd {

/// Says when copies are to be brought onto the device, which is done in groups, for it takes its
/// time for each: as much at once as goes quickly, for there is no progress meanwhile.
class CommitRule {
  public:
    using TimePoint = Clock::TimePoint;

    /// @param now when the first group begins.
    explicit CommitRule(TimePoint now) : last_(now) {}

    void songWasCopied(std::uint64_t bytes);

    [[nodiscard]] bool isDue(TimePoint now) const;

    /// The group was brought onto the device, and another one begins.
    void groupWasCommitted(TimePoint begun, TimePoint ended);

  private:
    std::size_t songs_ = 0;
    std::uint64_t bytes_ = 0;
    std::uint64_t mostBytes_ = std::uint64_t{64} << 20;
    TimePoint last_;
};

} // namespace quorl::syncd
