#pragma once

#include <cstdint>
#include <vector>

#include "quorl-syncd/transfer/Order.h"
#include "services/engine/EngineState.h"
#include "services/engine/Message.h"

namespace quorl::syncd {

/// What of a playlist is not on its way to the wearable.
struct Shortfall {
    /// What the playlist names and cannot be sent; of very many only the first.
    std::vector<engine::LeftOutItem> leftOut;
    std::uint64_t leftOutCount = 0;
    /// Songs that the limit leaves out.
    std::uint64_t beyondLimit = 0;

    bool operator==(const Shortfall&) const = default;
};

/// @param songProblems what has become of the order when it was last tried.
[[nodiscard]] Shortfall shortfallOf(const Order& order,
                                    const std::vector<engine::Message>& songProblems);

} // namespace quorl::syncd
