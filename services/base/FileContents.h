#pragma once

#include <cstddef>
#include <limits>
#include <span>
#include <string>

/// Reading and writing open files in full, also where the system does so in pieces or a signal
/// comes in between. Every failure throws `std::system_error`.
namespace quorl::base {

/// Reads what there is at the file's position, at most as much as the buffer holds; gives back how
/// many bytes that were, 0 at the end of the file.
[[nodiscard]] std::size_t readSome(int file, std::span<std::byte> buffer);

/// Everything from the file's position to its end, or the first `most` bytes of it.
[[nodiscard]] std::string readAll(int file,
                                  std::size_t most = std::numeric_limits<std::size_t>::max());

/// Writes all of `bytes` at the file's position.
void writeAll(int file, std::span<const std::byte> bytes);

} // namespace quorl::base
