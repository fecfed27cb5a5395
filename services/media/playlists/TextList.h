#pragma once

#include <compare>
#include <cstddef>
#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

namespace quorl::media {

/// An append-only list of byte strings in one piece of memory: four bytes on top of each text
/// instead of a string object and an allocation.
class TextList {
  public:
    [[nodiscard]] std::uint32_t size() const { return static_cast<std::uint32_t>(ends_.size()); }

    /// Of all texts together.
    [[nodiscard]] std::size_t bytes() const { return text_.size(); }

    /// The text at `index`, which is below `size()`. Valid until the next `add` or `shrink`.
    [[nodiscard]] std::string_view operator[](std::uint32_t index) const {
        const std::uint32_t begin = index == 0 ? 0 : ends_[index - 1];
        return std::string_view(text_).substr(begin, ends_[index] - begin);
    }

    /// All texts, one after the other.
    [[nodiscard]] std::string_view text() const { return text_; }

    /// Where in that each of them ends.
    [[nodiscard]] const std::vector<std::uint32_t>& ends() const { return ends_; }

    /// Appends a copy of `text` and gives its index back. Throws `std::length_error` beyond 4 GiB.
    std::uint32_t add(std::string_view text);

    /// Makes room for `bytes` more bytes of text.
    void reserve(std::size_t bytes) { text_.reserve(text_.size() + bytes); }

    /// Gives back memory that is held for further texts.
    void shrink();

    bool operator==(const TextList&) const = default;

  private:
    std::string text_;
    std::vector<std::uint32_t> ends_;
};

} // namespace quorl::media
