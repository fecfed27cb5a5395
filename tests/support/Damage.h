#pragma once

#include <algorithm>
#include <cstdint>
#include <random>
#include <string>
#include <string_view>

namespace quorl::tests {

/// Does to bytes what bad disks and broken transfers do; the same in each run.
class Damage {
  public:
    /// `seed` chooses among the sequences of damages.
    explicit Damage(std::uint32_t seed = 1) : numbers_(seed) {}

    /// `whole`, which is not empty, with up to eight damages, so that it differs.
    [[nodiscard]] std::string of(const std::string& whole) {
        std::string damaged;
        do {
            damaged = whole;
            for (std::size_t count = below(8) + 1; count > 0 && !damaged.empty(); --count) {
                damageOnce(damaged);
            }
        } while (damaged == whole);
        return damaged;
    }

    /// A number below `limit`, which is not 0.
    [[nodiscard]] std::size_t below(std::size_t limit) {
        return static_cast<std::size_t>(numbers_()) % limit;
    }

  private:
    void damageOnce(std::string& bytes) {
        constexpr std::string_view telling("\0\xFF\x7F\x80\x01", 5);
        const std::size_t at = below(bytes.size());
        const std::size_t length = std::min(below(64) + 1, bytes.size() - at);
        switch (below(6)) {
        case 0:
            bytes[at] = static_cast<char>(bytes[at] ^ (1 << below(8)));
            break;
        case 1:
            bytes[at] = static_cast<char>(below(256));
            break;
        case 2:
            bytes.replace(at, length, length, telling[below(telling.size())]);
            break;
        case 3:
            bytes.erase(at, length);
            break;
        case 4:
            bytes.insert(below(bytes.size()), bytes.substr(at, length));
            break;
        default:
            bytes.resize(std::max(at, bytes.size() / 2));
        }
    }

    std::mt19937 numbers_;
};

} // namespace quorl::tests
