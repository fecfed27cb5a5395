#pragma once

#include <cstddef>
#include <cstdint>

namespace quorl::simulation {

/// Numbers that follow from a seed, the same on every machine. Cheap to begin with, for each event
/// has its own.
class Random {
  public:
    explicit Random(std::uint64_t seed) : state_(seed) {}

    /// Any number below `end`, which is not 0.
    [[nodiscard]] std::uint64_t below(std::uint64_t end) { return seed() % end; }

    /// The same of an index.
    [[nodiscard]] std::size_t indexBelow(std::size_t end) {
        return static_cast<std::size_t>(below(end));
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
