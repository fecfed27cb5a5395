#pragma once

#include <cstddef>
#include <cstdint>
#include <filesystem>
#include <string>
#include <vector>

namespace quorl::power {

inline constexpr std::size_t sectorSize = 512;

/// What a kernel wrote to a disk, in order.
struct BlockLog {
    struct Write {
        std::uint64_t offset = 0;
        std::string bytes;
    };

    std::vector<Write> writes;
};

/// A disk as a loss of power may leave it: the first `whole` writes, and of the next one some
/// sectors. The disk holds nothing back, as its kernel knows.
struct PowerCut {
    std::size_t whole = 0;
    std::size_t sectors = 0;

    bool operator==(const PowerCut&) const = default;
};

/// @param text as the recorder has written it; a last entry that is not whole is left out.
[[nodiscard]] BlockLog parseBlockLog(const std::string& text);

/// After every write, and within each of several sectors.
[[nodiscard]] std::vector<PowerCut> powerCuts(const BlockLog& log);

/// @param disk as it was before the first write.
void apply(const BlockLog& log, const PowerCut& cut, std::string& disk);

[[nodiscard]] std::string toText(const PowerCut& cut);

} // namespace quorl::power
