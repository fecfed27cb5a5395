#pragma once

#include <concepts>
#include <cstdint>

namespace quorl::simulation {

/// Numbers that follow from a seed, the same on every machine. Cheap to begin with, for each event
/// has its own.
class Random {
  public:
    explicit Random(std::uint64_t seed) : state_(seed) {}

    /// Any number from 0 on and below `end`, which is above 0.
    template <std::integral Number>
    [[nodiscard]] Number below(Number end) {
        return static_cast<Number>(seed() % static_cast<std::uint64_t>(end));
    }

    /// True once in `times`, on average.
    [[nodiscard]] bool onceIn(std::uint64_t times) { return below(times) == 0; }

    /// Any number, to be the seed of numbers of their own.
    [[nodiscard]] std::uint64_t seed() {
        constexpr std::uint64_t step = 0x9E37'79B9'7F4A'7C15U;
        state_ += step;
        auto mixed = (state_ ^ (state_ >> 30U)) * 0xBF58'476D'1CE4'E5B9U;
        mixed = (mixed ^ (mixed >> 27U)) * 0x94D0'49BB'1331'11EBU;
        return mixed ^ (mixed >> 31U);
    }

  private:
    std::uint64_t state_;
};

} // namespace quorl::simulation
