#pragma once

#include <cstdint>
#include <string>

/// Figures for a person, in the user's language. They want a host.
namespace quorl {

/// "3.1 MB".
[[nodiscard]] std::string sizeWords(std::uint64_t bytes);

/// "1.2 GB of 4 GB free".
[[nodiscard]] std::string freeSpaceWords(std::uint64_t available, std::uint64_t capacity);

/// "1 song", "3 songs".
[[nodiscard]] std::string songsWords(std::uint64_t count);

/// "3 songs, 12 MB"; "None" for none.
[[nodiscard]] std::string songsWords(std::uint64_t count, std::uint64_t bytes);

} // namespace quorl
