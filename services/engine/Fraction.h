#pragma once

namespace quorl::engine {

/// A part of a whole, from 0 to 1, whatever it was made of: less counts as 0, more as 1, and what
/// is no number as 0.
class Fraction {
  public:
    constexpr Fraction() = default;

    constexpr explicit Fraction(double value) : value_(value > 1 ? 1 : value > 0 ? value : 0) {}

    // NOLINTNEXTLINE(google-explicit-constructor): read as the number that it is.
    constexpr operator double() const { return value_; }

  private:
    double value_ = 0;
};

} // namespace quorl::engine
