#include "quorl-syncd/transfer/pace/CommitRule.h"

#include <algorithm>

namespace quorl::syncd {

namespace {

/// Names of unfinished files have three digits.
constexpr std::size_t mostSongs = 500;
constexpr std::uint64_t smallestLimit = std::uint64_t{16} << 20;
constexpr std::uint64_t largestLimit = std::uint64_t{512} << 20;
constexpr std::chrono::seconds longest{1};
constexpr auto quickly = longest / 4.0;

} // namespace

void CommitRule::songWasCopied(std::uint64_t bytes) {
    ++songs_;
    bytes_ += bytes;
}

bool CommitRule::isDue(TimePoint now) const {
    return songs_ >= mostSongs || bytes_ >= mostBytes_ || now - last_ >= longest;
}

void CommitRule::groupWasCommitted(TimePoint begun, TimePoint ended) {
    const auto wished = ended - begun < quickly ? mostBytes_ * 2 : mostBytes_ / 2;
    mostBytes_ = std::clamp(wished, smallestLimit, largestLimit);
    songs_ = 0;
    bytes_ = 0;
    last_ = ended;
}

} // namespace quorl::syncd
