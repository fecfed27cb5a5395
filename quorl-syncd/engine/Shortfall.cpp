#include "quorl-syncd/engine/Shortfall.h"

#include <string>

namespace quorl::syncd {

namespace {

/// A message on the bus is not to become too long.
constexpr std::size_t mostListed = 500;

void add(Shortfall& shortfall, const std::string& entry, const std::string& code) {
    if (++shortfall.leftOutCount <= mostListed) {
        shortfall.leftOut.emplace_back(entry, code);
    }
}

} // namespace

Shortfall shortfallOf(const Order& order, const std::vector<engine::Message>& songProblems) {
    Shortfall shortfall;
    for (const auto& problem : songProblems) {
        add(shortfall, problem.arguments.front(), problem.code);
    }
    for (const auto* const leftOut : order.library->leftOutOf(order.playlist())) {
        add(shortfall, leftOut->entry, std::string(media::code(leftOut->reason)));
    }
    shortfall.beyondLimit = order.playlist().songs.size() - songsWithinLimit(order).size();
    return shortfall;
}

} // namespace quorl::syncd
