#pragma once

#include <cstddef>
#include <span>

namespace quorl::base {

/// The contents of an open file, from the beginning to the end, once.
class Reader {
  public:
    virtual ~Reader() = default;

    /// Reads on, at most as much as the buffer holds; gives back how many bytes that were, 0 at the
    /// end. Fails as whoever has opened it says.
    [[nodiscard]] virtual std::size_t read(std::span<std::byte> buffer) = 0;
};

} // namespace quorl::base
