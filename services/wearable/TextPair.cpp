#include "services/wearable/TextPair.h"

#include <algorithm>
#include <atomic>
#include <cstddef>
#include <cstdint>
#include <limits>
#include <new>
#include <stdexcept>

namespace quorl::wearable {

namespace {

/// Lengths take little room.
std::uint32_t lengthOf(std::string_view text) {
    if (text.size() > std::numeric_limits<std::uint32_t>::max()) {
        throw std::length_error("A name is too long.");
    }
    return static_cast<std::uint32_t>(text.size());
}

} // namespace

/// Is followed by the second text and, unless that ends with it, the first one.
struct TextPair::Block {
    std::atomic<std::uint32_t> owners;
    std::uint32_t firstSize;
    std::uint32_t secondSize;
    std::uint32_t firstAt;

    [[nodiscard]] char* text() { return reinterpret_cast<char*>(this + 1); }
};

TextPair::TextPair(std::string_view first, std::string_view second) {
    const auto firstSize = lengthOf(first);
    const auto secondSize = lengthOf(second);
    const bool isShared = second.ends_with(first);
    const auto size = std::size_t{secondSize} + (isShared ? 0 : firstSize);
    const auto firstAt = isShared ? secondSize - firstSize : secondSize;
    void* const memory = ::operator new(sizeof(Block) + size);
    block_ = new (memory) Block{1, firstSize, secondSize, firstAt};
    std::ranges::copy(second, block_->text());
    std::ranges::copy(first, block_->text() + firstAt);
}

TextPair::TextPair(const TextPair& other) noexcept : block_(other.block_) {
    if (block_ != nullptr) {
        block_->owners.fetch_add(1, std::memory_order_relaxed);
    }
}

TextPair::~TextPair() {
    if (block_ != nullptr && block_->owners.fetch_sub(1, std::memory_order_acq_rel) == 1) {
        block_->~Block();
        ::operator delete(block_);
    }
}

std::string_view TextPair::first() const {
    return block_ == nullptr
               ? std::string_view()
               : std::string_view(block_->text() + block_->firstAt, block_->firstSize);
}

std::string_view TextPair::second() const {
    return block_ == nullptr ? std::string_view()
                             : std::string_view(block_->text(), block_->secondSize);
}

} // namespace quorl::wearable
