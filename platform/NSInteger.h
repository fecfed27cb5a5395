#pragma once

#include <cstdint>

/// An unsigned and a signed machine word.
using NSUInteger = std::uintptr_t;
using NSInteger = std::intptr_t;

/// `value` truncated toward zero, held within what `Unsigned` can hold. Negative values and NaN
/// give 0. For `std::uint32_t` and `std::uint64_t`, so for `NSUInteger` on every target.
template <class Unsigned>
Unsigned NSSaturatingTruncate(double value);
