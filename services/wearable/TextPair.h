#pragma once

#include <string_view>
#include <utility>

namespace quorl::wearable {

/// Two texts that stay as they are. Copies share one piece of memory, in which a first text that
/// the second one ends with takes nothing. A plain value; any thread.
class TextPair {
  public:
    /// Two empty ones.
    TextPair() = default;

    /// Throws `std::length_error` beyond 4 GiB.
    TextPair(std::string_view first, std::string_view second);

    TextPair(const TextPair& other) noexcept;

    TextPair(TextPair&& other) noexcept : block_(std::exchange(other.block_, nullptr)) {}

    ~TextPair();

    TextPair& operator=(TextPair other) noexcept {
        std::swap(block_, other.block_);
        return *this;
    }

    /// Valid as long as any copy of the pair is there.
    [[nodiscard]] std::string_view first() const;
    [[nodiscard]] std::string_view second() const;

    bool operator==(const TextPair& other) const {
        return block_ == other.block_ || (first() == other.first() && second() == other.second());
    }

  private:
    struct Block;

    /// Null for two empty texts.
    Block* block_ = nullptr;
};

} // namespace quorl::wearable
