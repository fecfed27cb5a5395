#include "quorl-simulate/Shrinker.h"

#include <algorithm>
#include <utility>

namespace quorl::simulation {

namespace {

using IsBroken = std::function<bool(const Life&)>;

/// Leaves out pieces of `size` events wherever the life still breaks. Whether any was left out.
bool leaveOut(Life& life, std::size_t size, const IsBroken& isBroken) {
    bool isShorter = false;
    for (std::size_t begin = life.events.size(); begin > 0;) {
        begin -= std::min(begin, size);
        auto shorter = life;
        const auto first = shorter.events.begin() + static_cast<std::ptrdiff_t>(begin);
        const auto length = std::min(size, shorter.events.size() - begin);
        shorter.events.erase(first, first + static_cast<std::ptrdiff_t>(length));
        if (isBroken(shorter)) {
            life = std::move(shorter);
            isShorter = true;
        }
    }
    return isShorter;
}

} // namespace

Life shrunk(Life life, const IsBroken& isBroken) {
    for (std::size_t size = life.events.size() / 2; size > 0; size /= 2) {
        leaveOut(life, size, isBroken);
    }
    while (leaveOut(life, 1, isBroken)) {
    }
    for (auto& event : life.events) {
        auto same = std::exchange(event.wait, 0);
        if (!isBroken(life)) {
            event.wait = same;
        }
    }
    return life;
}

} // namespace quorl::simulation
