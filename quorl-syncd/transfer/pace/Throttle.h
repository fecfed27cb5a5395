#pragma once

#include <cstddef>
#include <cstdint>
#include <stop_token>

namespace quorl::syncd {

/// Holds up the copying of songs, so that it does not go faster than it may.
class Throttle {
  public:
    virtual ~Throttle() = default;

    /// How much to copy at once, so that progress moves several times a second; at least 1 byte.
    [[nodiscard]] virtual std::size_t chunk() const = 0;

    /// Called after each piece with its size: waits until more may be copied, or until `stop` is
    /// requested.
    virtual void pace(std::uint64_t bytes, const std::stop_token& stop) = 0;
};

} // namespace quorl::syncd
