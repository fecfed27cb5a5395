#pragma once

#include <cstdint>
#include <random>

namespace quorl::simulation {

/// Numbers that follow from a seed, the same on every machine.
class Random {
  public:
    explicit Random(std::uint64_t seed) : engine_(seed) {}

    /// Any number below `end`, which is not 0.
    [[nodiscard]] std::uint64_t below(std::uint64_t end) { return engine_() % end; }

    /// True once in `times`, on average.
    [[nodiscard]] bool onceIn(std::uint64_t times) { return below(times) == 0; }

    /// A seed for numbers of their own.
    [[nodiscard]] std::uint64_t seed() { return engine_(); }

  private:
    std::mt19937_64 engine_;
};

} // namespace quorl::simulation
